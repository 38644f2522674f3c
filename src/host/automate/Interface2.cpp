#include "host/automate/Interface2.h"

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::host {

Interface2::Interface2(Evt* creating) : Automate(creating) {
  addBranch("LECTURE", [this](Evt* e) { lecture(e); });
}

void Interface2::lecture(Evt* evt) {
  Valeur ident = evt != nullptr ? evt->valeur(0) : Valeur();
  Table main(this, nomBase(), nomTable(), "LECTURE");
  MemoryStore& record = session().memoire("I_" + nomTable());
  record.clear();
  if (main.chercher(3, "IDENT", '=', ident) != 0) {
    erreurMethode(1, evt);
    return;
  }
  Row& row = record.firstRow();
  row = main.ligne();
  erreurMethode(0, evt);
}

}  // namespace quarvo::host
