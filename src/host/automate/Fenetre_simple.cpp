#include "host/automate/Fenetre_simple.h"

#include <utility>

#include "host/table/Table.h"
#include "host/ui/Ecran.h"

namespace quarvo::host {

void Fenetre_simple::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "AVANT_DEBUT", "DEBUT", "DEBUT_ACTIVATION"}) {
    if (termine()) break;
    raise(label, e);
  }
}

bool Fenetre_simple::leverAction(const std::string& label) {
  EvtParamVal e;
  if (!raise(label, &e)) return true;
  return !rejete();
}

bool Fenetre_simple::saisirChamp(Field& field, const Valeur& value,
                                 const std::vector<std::string>& labels) {
  Valeur old = field.value();
  field.assign(value);
  for (const auto& label : labels) {
    if (termine()) break;
    if (!leverAction(label)) {
      field.assign(old);
      return false;
    }
  }
  return true;
}

void Fenetre_simple::listeSur(const std::string& list, Table& cursor) {
  ecran().liste(list);  // a list of the screen
  listesTables_[list].curseur = &cursor;
}

size_t Fenetre_simple::afficherListe(const std::string& list) {
  auto it = listesTables_.find(list);
  if (it == listesTables_.end()) return ecran().liste(list).lignes.size();
  Table& t = *it->second.curseur;
  ListeEcran& l = ecran().liste(list);
  const DescListe& d = *ecran().description().liste(list);
  RowId courant = l.courante >= 1 && l.courante <= it->second.lignes.size()
                      ? it->second.lignes[l.courante - 1]
                      : 0;
  it->second.lignes.clear();
  l.lignes.clear();
  l.courante = 0;
  t.ouvrir();
  while (t.lire(1) == 0) {
    it->second.lignes.push_back(t.courantId());
    std::vector<std::string> cells;
    for (const auto& c : d.colonnes) {
      cells.push_back(c.colonne.empty() ? std::string() : t.valeur(c.colonne).toChaine());
    }
    l.lignes.push_back(std::move(cells));
    if (t.courantId() == courant) l.courante = l.lignes.size();
  }
  if (l.courante == 0 && !l.lignes.empty()) l.courante = 1;
  if (l.courante != 0) t.aller(it->second.lignes[l.courante - 1]);
  size_t n = l.lignes.size();
  leverAction(list + (n == 0 ? "_LISTE_VIDE" : "_LISTE_PLEINE"));
  return n;
}

bool Fenetre_simple::saisirCellule(const std::string& list, size_t row, const std::string& column,
                                   const std::string& text) {
  if (auto it = listesTables_.find(list); it != listesTables_.end()) {
    ListeTable& lt = it->second;
    const DescListe& d = *ecran().description().liste(list);
    const DescColonne* c = nullptr;
    for (const auto& col : d.colonnes) {
      if (col.nom == column) c = &col;
    }
    if (c == nullptr || row == 0 || row > lt.lignes.size()) return false;
    Table& t = *lt.curseur;
    t.aller(lt.lignes[row - 1]);
    ecran().liste(list).courante = row;
    Valeur ancienne;
    if (!c->colonne.empty()) {
      ancienne = t.valeur(c->colonne);
      t.ecrire(c->colonne, Valeur::chaine(text));
    }
    bool accepte = leverAction(column);
    if (!accepte && !c->colonne.empty()) {
      t.aller(lt.lignes[row - 1]);
      t.ecrire(c->colonne, ancienne);
      t.modifier();
    }
    if (!termine()) afficherListe(list);
    return accepte;
  }
  ListeEcran& l = ecran().liste(list);
  const DescListe& d = *ecran().description().liste(list);
  size_t index = 0;
  while (index < d.colonnes.size() && d.colonnes[index].nom != column) ++index;
  if (row == 0 || row > l.lignes.size() || index == d.colonnes.size()) return false;
  l.courante = row;
  auto& cells = l.lignes[row - 1];
  cells.resize(d.colonnes.size());
  std::string old = std::exchange(cells[index], text);
  if (!leverAction(column)) {
    // The list may have been redrawn by the handler: undo only what is still there.
    ListeEcran& now = ecran().liste(list);
    if (row <= now.lignes.size() && index < now.lignes[row - 1].size()) {
      now.lignes[row - 1][index] = old;
    }
    return false;
  }
  return true;
}

bool Fenetre_simple::selectionnerLigne(const std::string& list, size_t row) {
  ListeEcran& l = ecran().liste(list);
  if (row == 0 || row > l.lignes.size()) return false;
  l.courante = row;
  if (auto it = listesTables_.find(list); it != listesTables_.end()) {
    if (row > it->second.lignes.size()) return false;
    it->second.curseur->aller(it->second.lignes[row - 1]);
    return leverAction(list + "_SELECTION");
  }
  return true;
}

bool Fenetre_simple::demanderOnglet(const std::string& tab) {
  if (!leverAction(tab)) return false;
  ecran().selectionnerOnglet(tab);
  leverAction(tab + "_ENTREE");
  return true;
}

bool Fenetre_simple::presserBouton(const std::string& button) {
  return leverAction(button);
}

bool Fenetre_simple::nouvelleLigne(const std::string& list) {
  ListeEcran& l = ecran().liste(list);
  l.lignes.emplace_back(ecran().description().liste(list)->colonnes.size());
  l.courante = l.lignes.size();
  return true;
}

bool Fenetre_simple::supprimerLigne(const std::string& list, size_t row) {
  ListeEcran& l = ecran().liste(list);
  if (row == 0 || row > l.lignes.size()) return false;
  l.lignes.erase(l.lignes.begin() + static_cast<std::ptrdiff_t>(row - 1));
  if (l.courante > l.lignes.size()) l.courante = l.lignes.size();
  return true;
}

void Fenetre_simple::fermer() {
  if (aUnEcran() && ecran().nonEnregistre()) {
    int answer =
        BoiteDialogue("Fermeture", "Les modifications ne sont pas enregistrées. Les abandonner ?",
                      0, {"$1~Oui", "$2~Non"});
    if (answer != 1) return;
  }
  sortir();
}

}  // namespace quarvo::host
