#include "suite/Afpfst.h"

#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afpfst::Afpfst(Evt* evt) : Interface2(evt) {
  addBranch("PURGER_QUARVO", [this](Evt* e) {
    Table pointing(this, nomBase(), "AFPFST", "POINTAGE");
    pointing.effacerCriteres();
    pointing.ajouterCritere("QUARVO_IDENT", '=', e->valeur(0));
    pointing.supprimerTout();
    erreurMethode(0, e);
  });
}

}  // namespace quarvo::suite
