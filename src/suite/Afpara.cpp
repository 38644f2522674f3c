#include "suite/Afpara.h"

#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

Afpara::Afpara(Evt* evt) : TableInterface(evt) {
  addBranch("REGROUPEMENT_ACHAT", [this](Evt* e) { regroupementAchat(e); });
}

void Afpara::regroupementAchat(Evt* evt) {
  Field& service = chaine("P_PRESTATION");
  evt->param(5, service, 1);
  service.set("");
  int64_t criterion = toEntier(evt->valeur(0));
  if (criterion < 1 || criterion > 3) criterion = 0;
  std::string key = evt->valeur(criterion == 0 ? 1 : static_cast<int>(criterion) + 1).toChaine();
  if (key.empty()) {
    erreurMethode(1, evt);
    return;
  }
  Table grouping(this, nomBase(), "AFREGACH", "REGROUPEMENT");
  grouping.effacerCriteres();
  grouping.ajouterCritere("CRITERE", '=', Valeur::entier(criterion));
  grouping.ajouterCritere("CLE_IDENT", '=', Valeur::chaine(key));
  if (grouping.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  service.assign(grouping.valeur("AFPRES_IDENT"));
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
