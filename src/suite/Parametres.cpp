#include "suite/Parametres.h"

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Parametres::Parametres(Evt* evt) : TableInterface(evt) {
  addBranch("LECTURE", [this](Evt* e) { lecture(e); });
}

void Parametres::lecture(Evt* evt) {
  std::string ident = evt != nullptr ? evt->valeur(0).toChaine() : std::string();
  if (!ident.empty()) {
    erreurMethode(lireDans("IDENT", Valeur::chaine(ident)) ? 0 : 1, evt);
    return;
  }
  MemoryStore& record = session().memoire("I_" + table());
  record.clear();
  Table main(this, nomBase(), table(), "LECTURE");
  main.effacerCriteres();
  if (main.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  record.remplacerPar(main.ligne());
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
