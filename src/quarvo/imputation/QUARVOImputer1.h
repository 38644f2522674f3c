// "QUARVO-IMPUTER1": the detail of one pointed piece, in which a controller splits each line of
// the piece over the budget lines the pointing found for it. Its header is the piece's record of
// "M_EAPPR", its lines the piece's records of "M_LAPPR", and for the current line the list "LSTV"
// shows the line's allocations ("M_VAPPR"). Only the work tables change here; the imputation
// writer turns them into links when the selection is validated.
//
// An allocation's "QTE" is the quantity being edited, "QTE0" the one last accepted: validating
// accepts them (a line whose allocations do not add up to its quantity marks the piece in
// error: not imputed), leaving otherwise puts every allocation back to what was accepted, with
// its amount and processed quantity. Quantities are compared within a millionth; the
// allocations of one line are all of the line's sign.
//
// Created with the piece's "M_EAPPR" identifier, by value.
#pragma once

#include <functional>
#include <string>

#include "host/automate/Gestion_document.h"
#include "host/table/Table.h"

namespace quarvo {

class QUARVOImputer1 : public host::Gestion_document {
 public:
  explicit QUARVOImputer1(host::Evt* evt);

  void debut_fiche(host::Evt* evt);
  void lst_liste_pleine(host::Evt* evt);
  void debut_fiche_ligne(host::Evt* evt);
  void active_requete_lstv(host::Evt* evt);
  void ctrl_cree_ligne(host::Evt* evt);
  void validation(host::Evt* evt) override;
  void apres_abandon(host::Evt* evt);
  void controle_ligne(host::Evt* evt);
  void validation_piece(host::Evt* evt);
  void abandon_piece(host::Evt* evt);
  void lstv_selection(host::Evt* evt);
  void lstv_c5(host::Evt* evt);
  void calcul_total_ligne(host::Evt* evt);

 private:
  // The allocations' key of the current line ("GAPLCOM|<line IDENT>").
  std::string cleAllocations();
  int executer(const std::string& label);
  // Each line of the piece, current on `ligne`, with its allocations' key.
  void pourChaqueLigne(
      const std::function<void(host::Table& ligne, const std::string& cle)>& faire);

  host::Field& pIdent_;
  host::Field& vDesig_;
  host::Field& vTotQte_;
  host::Field& i_;
  host::Field& vLibel_;
  host::Field& vLibelle_;
  host::Field& vChoix_;
  host::Table lappr_;
  host::Table vappr_;
  host::Table vappr2_;
};

}  // namespace quarvo
