#include "quarvo/imputation/QUARVOImputer_auto.h"

#include "host/session/Session.h"
#include "quarvo/frame/Appels.h"

namespace quarvo {

using namespace host;

QUARVOImputer_auto::QUARVOImputer_auto(Evt* evt)
    : Traitmnt(evt),
      vDateMin_(chaine("VDATEMIN")),
      vDateMax_(chaine("VDATEMAX")),
      vTypePiece_(chaine("VTYPE_PIECE")),
      vArbitrage_(entier("VARBITRAGE")),
      mo_(chaine("MO")),
      an_(chaine("AN")),
      vDebMo_(date("VDEBMO")),
      vFinMo_(date("VFINMO")),
      iAfsoci_(this, "VOVOVA", "I_AFSOCI", "") {
  nomBase("VOVOVA");
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FAIRE_SELECTION", [this](Evt* e) { faire_selection(e); });
  addBranch("FAIRE", [this](Evt* e) { faire(e); });
}

void QUARVOImputer_auto::debut(Evt* evt) {
  if (frame::appeler(*this, "AFSOCI", "LECTURE_CODE", {val("SOCIETE")}) != 0) {
    erreurMethode(1, evt);
    sortir(nullptr, 0);
    return;
  }
  std::string period = iAfsoci_.valeur("MOIS_ANNEE").toChaine();
  mo_.set(period.substr(0, 2));
  an_.set(period.size() >= 6 ? period.substr(2, 4) : "");
  auto first = Date::parse("01/" + mo_.text() + "/" + an_.text());
  vDebMo_.set(first ? *first : Date());
  vFinMo_.set(first ? first->lastOfMonth() : Date());
  appelerProcedure("", "", "", "FAIRE_SELECTION", evt, 0);
}

void QUARVOImputer_auto::faire_selection(Evt*) {
  vDateMin_.set("");
  vDateMax_.set(vFinMo_.text());
  vTypePiece_.set("T");
  vArbitrage_.set(int64_t{1});
}

void QUARVOImputer_auto::faire(Evt* evt) {
  for (const char* work : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) session().memoire(work).clear();
  EvtParamVal selection{vDateMin_.value(), vDateMax_.value(), vTypePiece_.value(),
                        vArbitrage_.value()};
  lancerModule("", "QUARVO", "QUARVO-POINTER_PIECES", &selection);
  lancerModule("", "QUARVO", "QUARVO-IMPUTER_PIECES", nullptr);
  erreurMethode(0, evt);
  sortir(nullptr, 0);
}

}  // namespace quarvo
