#include "support/Ecrans.h"

#include <stdexcept>

namespace quarvo::test {

using namespace host;

std::string jouer(ModeleEcran& modele, const std::string& line) {
  auto action = lireAction(line);
  if (!action) throw std::invalid_argument("not an action: " + line);
  bool accepted = modele.agir(*action);
  const EtatEcrans& e = modele.etat();
  std::string out = accepted ? "ok" : "refused";
  if (e.refus) {
    out += (e.refus->controle.empty() ? "" : " on " + e.refus->controle) + ": " + e.refus->texte;
  }
  for (const auto& m : e.messages) out += " | " + m;
  if (e.dialogue) {
    out += " | dialog " + e.dialogue->titre + ":";
    for (const auto& b : e.dialogue->boutons) out += " " + b;
    for (const auto& i : e.dialogue->elements) out += " " + i;
  }
  return out;
}

std::string champ(const ModeleEcran& modele, const std::string& field) {
  if (modele.etat().fenetres.empty()) return "(absent)";
  for (const auto& c : modele.etat().fenetres.back().champs) {
    if (c.nom == field) return c.valeur;
  }
  return "(absent)";
}

bool actif(const ModeleEcran& modele, const std::string& control) {
  if (modele.etat().fenetres.empty()) return false;
  const auto& w = modele.etat().fenetres.back();
  for (const auto* group : {&w.champs, &w.boutons}) {
    for (const auto& c : *group) {
      if (c.nom == control) return c.actif && c.visible;
    }
  }
  return false;
}

}  // namespace quarvo::test
