// "QUARVO-ANNULER": the screen on which a user undoes, in bulk, the links between purchasing
// pieces and project budgets.
//
// Tab "P1" gathers the selection: a period of piece dates ("VDATEMIN", empty for no lower
// bound; "VDATEMAX", the end of the company's current month at start, empty for no upper
// bound), a kind ("VTYPE_PIECE": "T" all, "C" orders, "B" goods-received notes, "F" invoices),
// a range of piece numbers ("VNUMMIN", "VNUMMAX", empty for no bound) and all projects or one
// ("VAFFA_TOUTES", "VAFFA_CODE"). "AVANCER" moves to tab "P2" once the user confirms (message
// "432"): the work table "M_EAPPR" is emptied and filled again with one row per piece of the
// selection that has at least one link row, each marked for cancellation ("IMPUTATION" "O"),
// while the waiting box shows the piece being read. In the list "LST" the user unmarks pieces
// ("N" in the fifth column); "VALID", once confirmed (message "86"), hands every piece still
// marked to the single-piece cancellation "QUARVO-ANNULER1", one transaction per piece; only
// "TERMINE" is left after that. The tabs move only through "AVANCER" and "RECULER": the tab
// control is disabled for a person, so the list cannot be reached without being rebuilt.
//
// A piece belongs to the chosen project when its header's section is that project, or, with no
// section on the header, when one of its lines carries it.
//
// The automaton owns its fields and cursors; "M_EAPPR" belongs to the session, shared by name
// with the imputation, and this screen empties it when it closes (whichever way it closes).
// Refusals: one project asked for without a code (message "438"), a "no" to "432" or "86", a
// fifth column other than "O" or "N". The screen does not open while the imputation selection
// or its piece detail is open (message "19"), nor when the company cannot be read (message
// "14").
#pragma once

#include <string>

#include "host/automate/Seletat.h"
#include "host/table/Champ.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo {

class QUARVOAnnuler : public host::Seletat {
 public:
  explicit QUARVOAnnuler(host::Evt* evt);

  void init(host::Evt* evt) override;
  void sortie_ecran(host::Evt* evt);
  void avant_debut(host::Evt* evt) override;
  void debut(host::Evt* evt) override;
  void validation(host::Evt* evt) override;
  void apres_validation(host::Evt* evt);
  void vaffa_toutes(host::Evt* evt) override;
  void vaffa_code_choisir(host::Evt* evt) override;

  void debut_activation(host::Evt* evt) override;
  void vdatemin(host::Evt* evt);
  void vdatemax(host::Evt* evt);
  void vnummin(host::Evt* evt);
  void vnummax(host::Evt* evt);
  void reculer(host::Evt* evt);
  void avancer(host::Evt* evt);
  void p1(host::Evt* evt);
  void p2(host::Evt* evt);
  void lst_selection(host::Evt* evt);
  void lst_c5(host::Evt* evt);
  void aband(host::Evt* evt);
  void termine(host::Evt* evt);
  void depointer_pieces(host::Evt* evt);
  void pointer_pieces(host::Evt* evt);
  void pointer_pieces_cf(host::Evt* evt);
  void pointer_pieces_bf(host::Evt* evt);
  void pointer_pieces_ff(host::Evt* evt);
  void creer_eappr(host::Evt* evt);
  void annuler_pieces(host::Evt* evt);

  // The close box leaves as "ABAND" does, through the screen exit.
  void fermer() override;

  using Sorte = frame::SorteSelection;  // one kind of piece: its tables and captions

 private:
  void listerPieces(host::Evt* evt, const Sorte& sorte);
  bool appartientALAffaire(host::Table& entete, host::Table& lignes);
  // A column of the current header of the kind being listed, read by name.
  host::Valeur entete(const std::string& column);
  void appelInterne(const std::string& label, host::Evt* evt);
  void autoriserSelection(bool oui);

  host::Field& vTypePiece_;
  host::Field& vNumMin_;
  host::Field& vNumMax_;
  host::Field& vExplications_;
  host::Field& vPiece_;
  host::Field& mo_;
  host::Field& an_;
  host::Field& vAnMo_;
  host::Field& vPointer_;
  host::Field& vEComposant_;
  host::Field& vLComposant_;
  host::Field& vZumdev_;
  host::Field& vFlag_;
  host::Field& vJauge1_;
  host::Field& vJauge2_;
  host::Field& vChoix_;

  host::Table quarvo2_;
  host::Table gapecom_;
  host::Table gapebl_;
  host::Table gapefac_;
  host::Table gaplcom_;
  host::Table gaplbl_;
  host::Table gaplfac_;
  host::Table iAfsoci_;
  host::Table eappr_;
  host::Table iGapefac_;

  host::Champ lienComposant_;
  host::Champ lienComposantIdent_;
  host::Champ moisAnnee_;
  host::Champ eComposant_;
  host::Champ eComposantIdent_;
  host::Champ ePiece_;
  host::Champ eIdent_;
  host::Champ eDatePiece_;
  host::Champ eHt_;
  host::Champ eImputation_;
  host::Champ factureType_;
};

}  // namespace quarvo
