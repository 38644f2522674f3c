#include "host/automate/Fenetre_simple.h"

#include <utility>

#include "host/ui/Ecran.h"

namespace quarvo::host {

void Fenetre_simple::executer(Evt* evt) {
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  for (const char* label : {"INIT", "DEBUT"}) {
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

bool Fenetre_simple::saisirCellule(const std::string& list, size_t row, const std::string& column,
                                   const std::string& text) {
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
