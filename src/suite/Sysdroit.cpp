#include "suite/Sysdroit.h"

#include <cctype>

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Sysdroit::Sysdroit(Evt* evt) : TableInterface(evt) {
  addBranch("LECTURE_DROITS_COURANTS", [this](Evt* e) { lectureDroitsCourants(e); });
  addBranch("COMPARE_DROIT", [this](Evt* e) { compareDroit(e); });
}

void Sysdroit::lectureDroitsCourants(Evt* evt) {
  Table rights(this, nomBase(), "SYSDROIT", "DROITS");
  MemoryStore& record = session().memoire("I_SYSDROIT");
  record.clear();
  rights.effacerCriteres();
  rights.ajouterCritere("SYSAPPLI_IDENT", '=', evt->valeur(0));
  rights.ajouterCritere("UTILISATEUR", '=', Valeur::chaine(session().utilisateur()));
  if (evt->valeur(0).toChaine().empty() || rights.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  record.remplacerPar(rights.ligne());
  erreurMethode(0, evt);
}

void Sysdroit::compareDroit(Evt* evt) {
  Field& modes = chaine("P_MODES");
  evt->param(0, modes, 1);
  std::string rights = evt->valeur(1).toChaine();
  std::string kept;
  for (char c : modes.text()) {
    char upper = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    if (rights.find(upper) != std::string::npos) kept += c;
  }
  modes.set(kept);
  erreurMethode(kept.empty() ? 1 : 0, evt);
}

}  // namespace quarvo::suite
