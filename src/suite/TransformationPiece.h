// "<MODULE>-TRF" for "GAPECOM", "GAPEBL", "GAPEFAC": carries a validated piece forward into the
// next piece of the purchasing chain (an order into a goods-received note or an invoice, a
// goods-received note into an invoice). One implementation; the kinds and which kind follows
// which are in their table of differences (SortesPiece.h). The target piece is made by the
// target module's own generation protocol ("DEBUT_GENERATION" ... "FIN_GENERATION", see
// PieceGeneration.h); this automaton writes what the transformation itself owns: the carried
// quantities of the source and the "CHAINAGE" rows.
//
// Rule: created with the target's type code (-3 goods-received note, -4 invoice) and the source
// piece's identifier. Each source line carries what is still to carry, "QTE" - "QTE_SOLDEE" -
// "QTT" (lines with nothing left, to a billionth, and comment lines are skipped), into one
// target line at the source line's price, discount, article, depot, section and VAT code. The
// target is dated today, for the same supplier, depot and section, with the source's
// designation, header discounts and requester, its "ORIGINE" the source's number and its own
// number "<prefix><yy><nnnnnn>" from the target kind's counter "NUMERO_DOC" in "ZUMNDOC" (a
// counter that does not exist yet starts above the kind's highest number); it is validated.
// The source then records what it carried: each line's "QTT" and the header's "QTT" grow by
// the quantity carried, the header's "QTNT" falls by it (never below 0), its carried amounts
// "MTNT_HT"/"MTNT_TTC" grow by the target's "HT"/"TTC", and its update stamp is renewed. One
// "CHAINAGE" row per carried line: "CLE_SRC" = source type | source identifier | source line
// rank, "TYPE_DST" the target's type, "IDE_DST" the target's identifier, "LIG_DST" the target
// line's rank. All of it is one transaction. The call fails, writing nothing and saying
// nothing (its caller tells the person), when the target kind does not follow the source's,
// the source does not exist, is not validated or has nothing left to carry, or the target
// module refuses a step.
#pragma once

#include <string>
#include <vector>

#include "host/automate/Traitmnt.h"
#include "host/table/Table.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

class TransformationPiece : public host::Traitmnt {
 public:
  TransformationPiece(host::Evt* evt, const SortePiece& sorte);
  void faire(host::Evt* evt) override;

 private:
  struct LigneAReporter {
    host::RowId ligne;  // the source line's row
    std::string rang;   // its rank
    double reste;       // the quantity it carries
  };
  bool transformer();
  bool generer(const SortePiece& cible, host::Table& source, host::Table& lignes,
               const std::vector<LigneAReporter>& aReporter);
  // The target's header columns that are not the generation protocol's.
  bool completerEntete(const SortePiece& cible, host::Table& source);
  // The next document number of `cible`; empty when it cannot be given.
  std::string numeroDocument(const SortePiece& cible);
  // `label` of `module`'s interface; true when it succeeded.
  bool appeler(const char* module, const char* label, host::Evt& evt);

  const SortePiece& sorte_;
  host::Field& typeCible_;
  host::Field& source_;
  host::Field& codePartage_;
  host::Field& cible_;
};

}  // namespace quarvo::suite
