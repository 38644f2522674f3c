#include "app/PiloteEcran.h"

namespace quarvo::app {

using namespace host;

namespace {

const EtatControle* champ(const EtatEcrans& etat, const std::string& name) {
  if (etat.fenetres.empty()) return nullptr;
  for (const auto& c : etat.fenetres.back().champs) {
    if (c.nom == name) return &c;
  }
  return nullptr;
}

}  // namespace

bool PiloteEcran::jouer(const Action& action) {
  bool accepted = model_.agir(action);
  // A question's answer may lead to another question: each is answered in turn.
  while (model_.etat().dialogue) {
    const EtatDialogue& d = *model_.etat().dialogue;
    Action answer;
    answer.genre = Action::Genre::Repondre;
    switch (d.genre) {
      case EtatDialogue::Genre::Message: {
        std::vector<std::string> buttons;
        for (size_t i = 0; i < d.boutons.size(); ++i) {
          buttons.push_back("$" + std::to_string(i + 1) + "~" + d.boutons[i]);
        }
        answer.valeur = std::to_string(terminal_.boiteDialogue(d.titre, d.texte, 0, buttons));
        break;
      }
      case EtatDialogue::Genre::Choix: {
        auto item = terminal_.choisir(d.titre, d.elements);
        if (item) answer.valeur = std::to_string(*item);
        break;
      }
      case EtatDialogue::Genre::Fichier:
        answer.valeur = terminal_.choisirFichier(d.titre, d.texte).value_or("");
        break;
    }
    accepted = model_.agir(answer) && accepted;
  }
  return accepted;
}

bool PiloteEcran::saisir(const std::string& field, const std::string& value) {
  if (const EtatControle* c = champ(model_.etat(), field); c != nullptr && c->valeur == value) {
    return true;
  }
  Action a;
  a.genre = Action::Genre::Saisir;
  a.cible = field;
  a.valeur = value;
  return jouer(a);
}

bool PiloteEcran::presser(const std::string& button) {
  Action a;
  a.genre = Action::Genre::Presser;
  a.cible = button;
  return jouer(a);
}

std::string PiloteEcran::valeur(const std::string& field) const {
  const EtatControle* c = champ(model_.etat(), field);
  return c == nullptr ? std::string() : c->valeur;
}

bool PiloteEcran::actif(const std::string& field) const {
  const EtatControle* c = champ(model_.etat(), field);
  return c != nullptr && c->actif && c->visible;
}

std::string PiloteEcran::refus() const {
  const auto& r = model_.etat().refus;
  return r ? r->texte : std::string();
}

}  // namespace quarvo::app
