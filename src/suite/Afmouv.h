// "AFMOUV": the accounting movements of linked pieces ("AFMOUV" table), one per piece.
//
// Rule: every label takes the piece's component table and identifier. "LECTURE_CLE_COMPO"
// reads the piece's live movement (state "G") into "I_AFMOUV" and fails when there is none.
// "GENERER_PIECE" creates the piece's movement (numbered by "ZUMNDOC", state "G", amount 0)
// unless a live one exists. "MAJ_PIECE_GENEREE" sets its amount ("MONTANT") and quantity to the
// sums of the piece's link rows and its date to the piece's date. "MAJ_PIECE_SUPPRIMEE" marks the
// piece's movements deleted (state "S"); "SUPPRIMER_PIECE" deletes them. The last three fail
// when the piece has no movement.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Afmouv : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Afmouv(host::Evt* evt);

 private:
  // Selects the piece's movements (only the live ones when `live`) on `t`.
  void selectionner(host::Table& t, host::Evt* evt, bool live);
  void lectureCleCompo(host::Evt* evt);
  void genererPiece(host::Evt* evt);
  void majPieceGeneree(host::Evt* evt);
  void majPieceSupprimee(host::Evt* evt);
  void supprimerPiece(host::Evt* evt);
};

}  // namespace quarvo::suite
