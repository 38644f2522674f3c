#include "suite/Action.h"

#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

namespace {
void selectionner(Table& t, const Evt* evt) {
  t.effacerCriteres();
  t.ajouterCritere("AUTOMATE", '=', evt->valeur(0));
  t.ajouterCritere("UTILISATEUR", '=', evt->valeur(1));
  t.ajouterCritere("CLE", '=', Valeur::chaine(""));
}
}  // namespace

Action::Action(Evt* evt) : Interface2(evt) {
  addBranch("LIT_PREF", [this](Evt* e) { litPref(e); });
  addBranch("ECRIT_PREF", [this](Evt* e) { ecritPref(e); });
}

void Action::litPref(Evt* evt) {
  Field value("P_VALEUR", "", "", 4, Kind::Chaine, Valeur::chaine(""), this);
  evt->param(2, value, 1);
  Table pref(this, "$$", "ACTPREF", "PREF");
  selectionner(pref, evt);
  value.set(pref.lire(3) == 0 ? pref.valeur("VALEUR").toChaine() : std::string());
  erreurMethode(0, evt);
}

void Action::ecritPref(Evt* evt) {
  Table pref(this, "$$", "ACTPREF", "PREF");
  selectionner(pref, evt);
  bool exists = pref.lire(3) == 0;
  if (!exists) {
    pref.preparer();
    pref.ecrire("AUTOMATE", evt->valeur(0));
    pref.ecrire("UTILISATEUR", evt->valeur(1));
    pref.ecrire("CLE", Valeur::chaine(""));
  }
  pref.ecrire("VALEUR", Valeur::chaine(evt->valeur(2).toChaine()));
  int rc = exists ? pref.modifier() : pref.inserer();
  erreurMethode(rc == 0 ? 0 : 1, evt);
}

}  // namespace quarvo::suite
