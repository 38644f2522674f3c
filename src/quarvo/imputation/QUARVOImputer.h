// "QUARVO-IMPUTER": the imputation selection. Three tabs walked in order with "AVANCER" and
// "RECULER" (the tab control itself takes no click: the pointing cannot be skipped): P1 the
// selection (period, kind of piece, number range, one project or all), P2 the proposal of the
// pointing (the pieces in "LST", each with its error flag and whether it is to be imputed, and
// the errors in "LST_ERREUR"), P3 the confirmation. Entering P2 from P1 empties the work tables
// and points the selection again; P3 back to P2 keeps them. A piece of the list opens in the
// detail "QUARVO-IMPUTER1" to split its lines over the budget lines; validating runs the
// imputation writer, after which the only way on is to leave. Leaving empties the work tables:
// they are the session's, and the next selection starts clean.
#pragma once

#include "host/automate/Seletat.h"
#include "host/table/Table.h"

namespace quarvo {

class QUARVOImputer : public host::Seletat {
 public:
  explicit QUARVOImputer(host::Evt* evt);

  void init(host::Evt* evt) override;
  void avant_debut(host::Evt* evt) override;
  void debut(host::Evt* evt) override;
  void debut_activation(host::Evt* evt) override;
  void vdatemin(host::Evt* evt);
  void vdatemax(host::Evt* evt);
  void vnummin(host::Evt* evt);
  void vnummax(host::Evt* evt);
  void vaffa_toutes(host::Evt* evt) override;
  void vaffa_code_choisir(host::Evt* evt) override;
  void reculer(host::Evt* evt);
  void avancer(host::Evt* evt);
  void p1(host::Evt* evt);
  void p2(host::Evt* evt);
  void p3(host::Evt* evt);
  void lst_liste_vide(host::Evt* evt);
  void lst_liste_pleine(host::Evt* evt);
  void lst_selection(host::Evt* evt);
  void lst_c5(host::Evt* evt);
  void validation(host::Evt* evt) override;
  void apres_validation(host::Evt* evt);
  void aband(host::Evt* evt);
  void sortie_ecran(host::Evt* evt);
  void termine(host::Evt* evt);
  void depointer_pieces(host::Evt* evt);
  void pointer_pieces(host::Evt* evt);
  void gerer_imputation(host::Evt* evt);
  void exporter_liste_csv(host::Evt* evt) override;

  void fermer() override;

 private:
  int executer(const std::string& label);
  void message(const std::string& number);
  void onglets(const std::string& tab);
  void viderTables();

  host::Field& vtypePiece_;
  host::Field& vnummin_;
  host::Field& vnummax_;
  host::Field& vexplications_;
  host::Field& vpiece_;
  host::Field& mo_;
  host::Field& an_;
  host::Field& vDateFin_;
  host::Field& vPointer_;
  host::Field& vOngletPrecedent_;
  host::Field& vEComposant_;
  host::Field& vZumdev_;
  host::Field& vChoix_;
  host::Table eappr_;
  host::Table erreurs_;
};

}  // namespace quarvo
