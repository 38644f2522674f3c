// "QUARVO-IMPETAT1": prints the purchase follow-up report from "M_APPR1" on the layout
// "IMPETAT1": per grouping criterion, per project (a page each when asked), per budget with
// its origin caption, the budget lines with their pieces, totals per line, budget, project,
// criterion and overall, then the two recapitulations by criterion (totals the engine gathers
// from "M_APPR1" itself). Created with the share code, the period, the criterion, the selection
// summary and the five options "VOPTIONS" (page per project, lines, pieces, recapitulation 1 and
// 2), all by value.
#pragma once

#include "host/automate/Edition_etat.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOImpetat1 : public host::Edition_etat {
 public:
  explicit QUARVOImpetat1(host::Evt* evt);

  void init(host::Evt* evt) override;
  void debut(host::Evt* evt) override;
  void lst_debut3(host::Evt* evt);
  void lst_corps_imprime(host::Evt* evt);
  void lst_fin4_imprime(host::Evt* evt);

 private:
  std::string libelle(const std::string& key);
  bool lireLigne();
  std::string prefixe();

  host::Field& codePartage_;
  host::Field& vdatemin_;
  host::Field& vdatemax_;
  host::Field& vclassement_;
  host::Field& vselection_;
  host::Field& voptions_;
  host::Field& vfolio_;
  host::Field& vcorps_;
  host::Field& vcorps2_;
  host::Field& vrecap1_;
  host::Field& vrecap2_;
  host::Field& vtypePiece_;
  host::Field& vdebut1_;
  host::Field& vfin1_;
  host::Field& vfin4_;
  host::Field& vdesig4_;
  host::Field& vdesig_;
  host::Field& vLibel_;
  host::Field& vLibPiece1_;
  host::Field& vLibPiece2_;
  host::Field& vEdition_;

  host::Table mAppr1_;
  host::Table iAfvoca_;
  host::Table iAfebud_;
  host::Table iAflbud_;
  host::Champ afebudIdent_;
  host::Champ aflbudIdent_;
  host::Champ desig_;

  std::string ligneLue_;  // the budget line current in "I_AFLBUD"
};

}  // namespace quarvo
