#include "suite/Afdroi.h"

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afdroi::Afdroi(Evt* evt) : Interface2(evt) {
  addBranch("CONTROLER_DROITS_AFAFFA", [this](Evt* e) { controlerDroitsAfaffa(e); });
}

void Afdroi::controlerDroitsAfaffa(Evt* evt) {
  std::string etab = evt->valeur(1).toChaine();
  std::string serv = evt->valeur(2).toChaine();
  Table droits(this, nomBase(), "AFDROI", "CONTROLE");
  droits.effacerCriteres();
  droits.ajouterCritere("UTILISATEUR", '=', Valeur::chaine(session().utilisateur()));
  if (droits.ouvrir() != 0) {
    erreurMethode(0, evt);  // no row: the user sees every project
    return;
  }
  while (droits.lire(1) == 0) {
    std::string e = droits.valeur("AFETAB_CODE").toChaine();
    std::string s = droits.valeur("AFSERV_CODE").toChaine();
    if ((e.empty() || e == etab) && (s.empty() || s == serv)) {
      erreurMethode(0, evt);
      return;
    }
  }
  erreurMethode(1, evt);
}

}  // namespace quarvo::suite
