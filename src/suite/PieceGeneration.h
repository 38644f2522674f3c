// The purchasing piece modules "GAPEDEV", "GAPECOM", "GAPEBL", "GAPEFAC": the generic reads of
// their header table, validation, and the protocol by which another module generates pieces.
//
// Rule (module = header table; its lines are "GAPL..." with the same ending):
// - "DEBUT_GENERATION" (sharing code by reference, mode): opens a generation of this kind for
//   the session. The sharing code is a new text ("<TABLE>-<n>"); the exchange record "M_GENERE"
//   gets one row whose "INST" is that code. A generation already open is replaced.
// - "DEBUT_PIECE_GENEREE" (piece identifier by reference, supplier identifier, date, depot,
//   currency, -1, [section], [credit note]): creates the header: "IDENT" from "ZUMNDOC", supplier,
//   its payment terms "GCPREG_IDENT" and VAT regime "GCPREGM_IDENT", date, depot, section
//   ("SECAN_CODE"), "TYPE" 'A' for a credit note and 'F' for another invoice, "DATE_MAJ" and
//   "HEURE_MAJ" now, "VALIDEE" 0. Fails (with its text) when no generation is open, the
//   supplier does not exist or the date is empty.
// - "LIGNE_COPIEE": copies the exchange record into a new line of the current piece: "IDENT"
//   from "ZUMNDOC", "NUMERO" = piece "IDENT" | rank, the record's article, designation,
//   quantity, unit price, discount, depot, section, VAT code and style; "BRUT" = quantity x
//   unit price and "HT" = "BRUT" less the discount %, each rounded to the cent. A comment line
//   ("STYLE" 2) carries no quantity nor amount. Fails when no piece is being generated.
// - "FIN_PIECE_GENEREE": totals of the current piece: "BRUT" = sum of the lines' "HT", "HT" =
//   "BRUT" less the header discount plus carriage and fees, "TTC" = "HT" + each line's VAT (its
//   "HT" times the rate of its VAT code in the piece's regime, to the cent), "NET_A_PAYER" =
//   "TTC", "QTNT" = sum of the quantities, "QTT" = 0.
// - "FIN_GENERATION": closes the generation and empties the exchange record; fails when none
//   is open.
// - "TEXTE_ERREUR_GENERATION" (text by reference): the text of the last failure of this
//   module's generation protocol in the session.
// - "VALIDE_DOCUMENT" (piece identifier): "VALIDEE" = 1; fails when the piece does not exist.
// The generation state lives in the session's memory table "M_GENERATION" (one row per module).
// It also keeps the running totals of the current piece (lines' "HT", their VAT, quantities),
// added up as each line is copied: lines reach a generated piece only through "LIGNE_COPIEE",
// so "FIN_PIECE_GENEREE" need not read them back.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class PieceGeneration : public TableInterface {
 public:
  explicit PieceGeneration(host::Evt* evt);

 private:
  void debutGeneration(host::Evt* evt);
  void debutPieceGeneree(host::Evt* evt);
  void ligneCopiee(host::Evt* evt);
  void finPieceGeneree(host::Evt* evt);
  void finGeneration(host::Evt* evt);
  void texteErreur(host::Evt* evt);
  void valideDocument(host::Evt* evt);

  // Records `text` as the module's last failure and fails the call.
  void echec(host::Evt* evt, const std::string& text);
  // Selects the rows of this module in one of the session's generation tables.
  void duModule(host::Table& t) const;
  std::string lignes() const;
};

}  // namespace quarvo::suite
