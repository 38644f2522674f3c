#include "suite/Gcpcompt.h"

#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Gcpcompt::Gcpcompt(Evt* evt) : TableInterface(evt) {
  addBranch("LECTURE_SIMPLE", [this](Evt* e) { lectureSimple(e); });
}

void Gcpcompt::lectureSimple(Evt* evt) {
  Field& result = chaine("P_VALEUR");
  evt->param(2, result, 1);
  result.set("");
  Table config(this, "GESCOM", table(), "LECTURE_SIMPLE");
  config.effacerCriteres();
  config.ajouterCritere("GENRE", '=', Valeur::chaine(evt->valeur(0).toChaine()));
  config.ajouterCritere("CLE", '=', Valeur::chaine(evt->valeur(1).toChaine()));
  if (config.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  result.assign(config.valeur("VALEUR"));
  erreurMethode(result.text().empty() ? 1 : 0, evt);
}

}  // namespace quarvo::suite
