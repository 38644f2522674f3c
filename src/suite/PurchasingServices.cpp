#include "suite/PurchasingServices.h"

#include "host/session/Session.h"
#include "host/table/Table.h"

namespace quarvo::suite {

using namespace host;

std::string numeroAchat(Automate& caller, const std::string& table) {
  Field& ident = caller.chaine("V_NUMERO_" + table);
  EvtParamRef attribue{val("GESCOM"), val("NUMEROS"), val(table), val(""), val(10), ref(ident)};
  if (caller.session().appelerProcedure("ZUMNDOC", "ATTRIBUE_NUMERO", &attribue) != 0) return "";
  EvtParamRef valide{val("GESCOM"), val("NUMEROS"), val(table), val(""), val(10), ref(ident)};
  if (caller.session().appelerProcedure("ZUMNDOC", "VALIDE_NUMERO", &valide) != 0) return "";
  return ident.text();
}

// ---------------------------------------------------------------------------------------------

Gcpste::Gcpste(Evt* evt) : TableInterface(evt) {
  addBranch("LECTURE", [this](Evt* e) { lecture(e); });
  addBranch("DEPOT", [this](Evt* e) { depot(e); });
}

void Gcpste::lecture(Evt* evt) {
  std::string ident = evt->valeur(0).toChaine();
  if (!ident.empty()) {
    erreurMethode(lireDans("IDENT", Valeur::chaine(ident)) ? 0 : 1, evt);
    return;
  }
  Table settings(this, "GESCOM", "GCPSTE", "LECTURE");
  MemoryStore& record = session().memoire("I_GCPSTE");
  record.clear();
  settings.effacerCriteres();
  if (settings.lire(3) != 0) {
    erreurMethode(1, evt);
    return;
  }
  record.remplacerPar(settings.ligne());
  erreurMethode(0, evt);
}

void Gcpste::depot(Evt* evt) {
  Field& depot = chaine("P_DEPOT");
  evt->param(0, depot, 1);
  Table settings(this, "GESCOM", "GCPSTE", "DEPOT");
  settings.effacerCriteres();
  if (settings.lire(3) != 0) {
    depot.set("");
    erreurMethode(1, evt);
    return;
  }
  depot.set(settings.valeur("GCPDEPOT_IDENT").toChaine());
  erreurMethode(0, evt);
}

// ---------------------------------------------------------------------------------------------

Gcpdepot::Gcpdepot(Evt* evt) : TableInterface(evt) {
  addBranch("DEPOT_PRINCIPAL", [this](Evt* e) { depotPrincipal(e); });
}

void Gcpdepot::depotPrincipal(Evt* evt) {
  Field& depot = chaine("P_DEPOT");
  evt->param(0, depot, 1);
  Table depots(this, "GESCOM", "GCPDEPOT", "PRINCIPAL");
  if (depots.chercher(3, "PRINCIPAL", '=', Valeur::entier(1)) != 0) {
    depots.effacerCriteres();
    if (depots.lire(3) != 0) {
      depot.set("");
      erreurMethode(1, evt);
      return;
    }
  }
  depot.set(depots.valeur("IDENT").toChaine());
  erreurMethode(0, evt);
}

// ---------------------------------------------------------------------------------------------

Gapartfo::Gapartfo(Evt* evt) : TableInterface(evt) {
  addBranch("LECTURE_ET_CREATION", [this](Evt* e) { lectureEtCreation(e); });
}

void Gapartfo::lectureEtCreation(Evt* evt) {
  Valeur article = evt->valeur(0);
  Valeur fournisseur = evt->valeur(1);
  MemoryStore& record = session().memoire("I_GAPARTFO");
  record.clear();
  if (article.toChaine().empty() || fournisseur.toChaine().empty()) {
    erreurMethode(1, evt);
    return;
  }
  Table lien(this, "GESCOM", "GAPARTFO", "LIEN");
  lien.effacerCriteres();
  lien.ajouterCritere("GCPARTIC_IDENT", '=', article);
  lien.ajouterCritere("GCPFOUR_IDENT", '=', fournisseur);
  if (lien.lire(3) != 0) {
    if (toEntier(evt->valeur(2)) != 1) {
      erreurMethode(1, evt);
      return;
    }
    std::string ident = numeroAchat(*this, "GAPARTFO");
    if (ident.empty()) {
      erreurMethode(1, evt);
      return;
    }
    Table art(this, "GESCOM", "GCPARTIC", "LIEN");
    Valeur prix = art.chercher(3, "IDENT", '=', article) == 0 ? art.valeur("PUHT")
                                                              : Valeur::monnaie(Monnaie());
    lien.preparer();
    lien.ecrire("IDENT", Valeur::chaine(ident));
    lien.ecrire("GCPARTIC_IDENT", article);
    lien.ecrire("GCPFOUR_IDENT", fournisseur);
    lien.ecrire("PUHT", prix);
    if (lien.inserer() != 0) {
      erreurMethode(1, evt);
      return;
    }
  }
  record.remplacerPar(lien.ligne());
  erreurMethode(0, evt);
}

// ---------------------------------------------------------------------------------------------

Gapech::Gapech(Evt* evt) : TableInterface(evt) {
  addBranch("CREER_DEFAUT", [this](Evt* e) { creerDefaut(e); });
}

void Gapech::creerDefaut(Evt* evt) {
  Valeur facture = evt->valeur(0);
  Date date = toDate(evt->valeur(4));
  if (facture.toChaine().empty() || date.empty()) {
    erreurMethode(1, evt);
    return;
  }
  Table termes(this, "GESCOM", "GCPREG", "ECHEANCE");
  Date echeance = date;
  if (termes.chercher(3, "IDENT", '=', evt->valeur(3)) == 0) {
    echeance = date.addDays(static_cast<int>(toEntier(termes.valeur("NB_JOURS"))));
    if (toEntier(termes.valeur("FIN_MOIS")) == 1) echeance = echeance.lastOfMonth();
  }
  Table echeances(this, "GESCOM", "GAPECH", "ECHEANCE");
  echeances.effacerCriteres();
  echeances.ajouterCritere("GAPEFAC_IDENT", '=', facture);
  echeances.supprimerTout();
  std::string ident = numeroAchat(*this, "GAPECH");
  if (ident.empty()) {
    erreurMethode(1, evt);
    return;
  }
  echeances.preparer();
  echeances.ecrire("IDENT", Valeur::chaine(ident));
  echeances.ecrire("GAPEFAC_IDENT", facture);
  echeances.ecrire("NUMERO_DOC", evt->valeur(1));
  echeances.ecrire("NUMERO", Valeur::entier(1));
  echeances.ecrire("GCPFOUR_IDENT", evt->valeur(2));
  echeances.ecrire("GCPREG_IDENT", evt->valeur(3));
  echeances.ecrire("DATE_ECHEANCE", Valeur::date(echeance));
  echeances.ecrire("MONTANT", Valeur::monnaie(toMonnaie(evt->valeur(5))));
  erreurMethode(echeances.inserer(), evt);
}

}  // namespace quarvo::suite
