#include "suite/VuePiece.h"

#include <algorithm>
#include <charconv>

#include "host/table/Table.h"
#include "host/ui/Ecran.h"

namespace quarvo::suite {

using namespace host;

namespace {

int64_t rangNumerique(const std::string& numero) {
  std::string rang = rangLigne(numero);
  int64_t n = 0;
  std::from_chars(rang.data(), rang.data() + rang.size(), n);
  return n;
}

}  // namespace

VuePiece::VuePiece(Evt* evt, const SortePiece& sorte)
    : Fenetre_simple(evt), sorte_(sorte), ident_(chaine("P_IDENT")), modes_(chaine("P_MODES")) {
  for (const ChampVue& c : sorte_.champs) {
    champs_.push_back(&declare(c.kind, c.champ, "", Valeur::initial(c.kind)));
  }
  lierParametres(evt, {{&ident_, 0}, {&modes_, 0}});
  nomBase(sorte_.base);
  nomTable(sorte_.module);
  nomEcran(sorte_.ecran);
  modeSaisie(modes_.text());
  addBranch("DEBUT", [this](Evt* e) { debut(e); });
  addBranch("FERMER", [this](Evt*) { sortir(); });
}

Valeur VuePiece::montre(const Valeur& value, const char* codeDe) {
  if (codeDe == nullptr) return value;
  Table reference(this, sorte_.base, codeDe, "VUE");
  if (value.toChaine().empty() || reference.chercher(3, "IDENT", '=', value) != 0) {
    return Valeur::chaine("");
  }
  return reference.valeur("CODE");
}

void VuePiece::debut(Evt* evt) {
  Table entete(this, sorte_.base, sorte_.module, "VUE");
  if (ident_.text().empty() || entete.chercher(3, "IDENT", '=', ident_.value()) != 0) {
    BoiteDialogue(sorte_.libelle,
                  std::string(sorte_.libelle) + " : la pièce " + ident_.text() +
                      " n'existe pas, elle ne peut pas être affichée.",
                  0, {"$1~OK"});
    erreurMethode(1, evt);
    sortir();
    return;
  }
  Table lignes(this, sorte_.base, sorte_.lignes, "VUE");
  for (size_t i = 0; i < sorte_.champs.size(); ++i) {
    const ChampVue& c = sorte_.champs[i];
    if (!c.total) {
      champs_[i]->assign(montre(entete.valeur(c.colonne), c.codeDe));
      continue;
    }
    Monnaie montant;
    double quantite = 0;
    selectionnerLignes(lignes, ident_.text());
    while (lignes.lire(1) == 0) {
      montant += toMonnaie(lignes.valeur(c.colonne));
      quantite += toDouble(lignes.valeur(c.colonne));
    }
    champs_[i]->assign(c.kind == Kind::Monnaie ? Valeur::monnaie(montant) : Valeur::dbl(quantite));
  }
  remplirLignes(lignes);
  ecran().setMode("V");
  ecran().setTitre(std::string(sorte_.libelle) + " " + entete.valeur("NUMERO_DOC").toChaine());
  erreurMethode(0, evt);
}

void VuePiece::remplirLignes(Table& lignes) {
  struct Ligne {
    int64_t rang;
    std::vector<std::string> cellules;
  };
  std::vector<Ligne> rows;
  selectionnerLignes(lignes, ident_.text());
  while (lignes.lire(1) == 0) {
    std::string numero = lignes.valeur("NUMERO").toChaine();
    Ligne l{rangNumerique(numero), {}};
    for (const ColonneVue& c : sorte_.colonnes) {
      l.cellules.push_back(std::string(c.colonne) == "NUMERO"
                               ? rangLigne(numero)
                               : montre(lignes.valeur(c.colonne), c.codeDe).toChaine());
    }
    rows.push_back(std::move(l));
  }
  std::stable_sort(rows.begin(), rows.end(),
                   [](const Ligne& a, const Ligne& b) { return a.rang < b.rang; });
  ListeEcran& liste = ecran().liste("LST");
  liste.lignes.clear();
  for (auto& r : rows) liste.lignes.push_back(std::move(r.cellules));
  liste.courante = liste.lignes.empty() ? 0 : 1;
}

}  // namespace quarvo::suite
