#include "suite/Afresu.h"

#include "host/session/Session.h"
#include "host/table/Champ.h"

namespace quarvo::suite {

using namespace host;

namespace {
// Positions `t` on the results row of the key, created when missing.
void positionner(Table& t, const Valeur& project, const Valeur& post, const Valeur& period,
                 const std::string& type) {
  t.effacerCriteres();
  t.ajouterCritere("AFAFFA_IDENT", '=', project);
  t.ajouterCritere("AFPOST_CODE", '=', post);
  t.ajouterCritere("ANNEE_MOIS", '=', period);
  t.ajouterCritere("TYPE", '=', Valeur::chaine(type));
  if (t.lire(3) == 0) return;
  t.preparer();
  t.ecrire("AFAFFA_IDENT", project);
  t.ecrire("AFPOST_CODE", post);
  t.ecrire("ANNEE_MOIS", period);
  t.ecrire("TYPE", Valeur::chaine(type));
  t.inserer();
}
}  // namespace

Afresu::Afresu(Evt* evt) : Interface2(evt) {
  addBranch("MAJ_AFRESU", [this](Evt* e) { majAfresu(e); });
  addBranch("CALCUL_RAF_D", [this](Evt* e) { calculRafD(e); });
}

void Afresu::majAfresu(Evt* evt) {
  Table records(this, nomBase(), "M_RESU1", "");
  Table results(this, nomBase(), "AFRESU", "RESULTATS");
  records.ouvrir();
  while (records.lire(1) == 0) {
    std::string type = records.valeur("TYPE").toChaine();
    positionner(results, records.valeur("AFAFFA_IDENT"), records.valeur("AFPOST_CODE"),
                records.valeur("ANNEE_MOIS"), type.empty() ? "D" : type);
    Champ committed("VENG", results);
    committed.set(committed.monnaie() - toMonnaie(records.valeur("VENG")));
    results.modifier();
  }
  records.effacerCriteres();
  records.supprimerTout();
  erreurMethode(0, evt);
}

void Afresu::calculRafD(Evt* evt) {
  Valeur project = evt->valeur(0);
  Valeur post = evt->valeur(1);
  Table lines(this, nomBase(), "AFLBUD", "LIGNES");
  Table services(this, nomBase(), "AFPRES", "PRESTATIONS");
  Monnaie budget;
  Monnaie realised;
  lines.chercher(3, "AFAFFA_IDENT", '=', project);
  lines.ouvrir();
  while (lines.lire(1) == 0) {
    if (services.chercher(3, "IDENT", '=', lines.valeur("AFPRES_IDENT")) != 0) continue;
    if (services.valeur("POSTE_ACHAT").toChaine() != post.toChaine()) continue;
    budget += toMonnaie(lines.valeur("VBUD_D"));
    realised += Champ("VREA", lines).at(0);
  }
  Table results(this, nomBase(), "AFRESU", "RESULTATS");
  positionner(results, project, post, evt->valeur(2), "D");
  results.ecrire("VBUD_D", Valeur::monnaie(budget));
  results.ecrire("VREA", Valeur::monnaie(realised));
  Monnaie rest = budget - realised;
  results.ecrire("VRAF_D", Valeur::monnaie(rest < Monnaie() ? Monnaie() : rest));
  results.modifier();
  erreurMethode(0, evt);
}

}  // namespace quarvo::suite
