#include "suite/Afmenu.h"

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afmenu::Afmenu(Evt* evt) : Interface2(evt) {
  addBranch("VERIF_DOSSIER", [this](Evt* e) { verifDossier(e); });
}

void Afmenu::verifDossier(Evt* evt) {
  Table company(this, nomBase(), "AFSOCI", "DOSSIER");
  bool ok = company.chercher(3, "CODE", '=', Valeur::chaine(session().societe())) == 0;
  if (ok) {
    std::string period = company.valeur("MOIS_ANNEE").toChaine();
    ok = period.size() == 6 && period.find_first_not_of("0123456789") == std::string::npos;
  }
  erreurMethode(ok ? 0 : 1, evt);
}

}  // namespace quarvo::suite
