// "QUARVO-IMPUTER_PIECES": turns the pointing kept in the work tables ("M_EAPPR", "M_LAPPR",
// "M_VAPPR") into link rows: one row per budget line, piece kind and piece number, adding up
// the quantities and amounts of the piece's lines allocated to that budget line. Around each
// write the budget line's figures are withdrawn and recomputed through the module's interface.
// Pieces marked in error ("IMPUTATION" "N") and allocations without quantity write nothing.
// Each piece is written whole or not at all, so an interrupted run can be run again.
//
// Two jobs may impute the same pieces at once: each piece is decided inside its own write
// transaction, one writer at a time. A piece that has link rows of the version pointed (another
// job linked it since the pointing) is left as it is, never added to; a piece whose link rows are
// of an earlier version (it changed since it was linked) has them cancelled ("QUARVO-ANNULER1")
// in the same transaction, before its new ones are written. Each piece's record of "M_EAPPR"
// then says what this run did: "ECRITURE" ("ECRITE" or "DEJA_LIEE"), the link rows it created
// ("LIENS_CREES") and the amount it linked ("HT_LIE").
#pragma once

#include "host/automate/Traitmnt.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOImputer_pieces : public host::Traitmnt {
 public:
  explicit QUARVOImputer_pieces(host::Evt* evt);

  void faire(host::Evt* evt) override;
  void suppression_maj_liens(host::Evt* evt);
  void maj_quarvo(host::Evt* evt);
  void maj_liens(host::Evt* evt);

 private:
  // Writes the links of the current piece of "M_EAPPR"; says what it did.
  std::string ecrirePiece(host::Evt* evt);
  int64_t liensCrees_ = 0;
  host::Monnaie htLie_;
  host::Field& vIdent_;
  host::Table eappr_;
  host::Table lappr_;
  host::Table vappr_;
  host::Table iAflbud_;
  host::Table iAfaffa_;
  host::Table quarvo_;
};

}  // namespace quarvo
