#include "host/ui/Ecran.h"

#include "host/UException.h"

namespace quarvo::host {

Ecran::Ecran(std::shared_ptr<const DescriptionEcran> description)
    : description_(std::move(description)), titre_(description_->titre) {
  const auto& d = *description_;
  for (const auto& c : d.champs) controles_[c.nom] = {c.actif, c.visible};
  for (const auto& b : d.boutons) controles_[b.nom] = {b.actif, b.visible};
  for (const auto& t : d.onglets) controles_[t.nom] = {};
  for (const auto& g : d.groupes) controles_[g.nom] = {};
  for (const auto& l : d.listes) {
    controles_[l.nom] = {};
    listes_[l.nom] = {};
    for (const auto& c : l.colonnes) controles_[c.nom] = {};
  }
  if (!d.controleOnglets.empty()) controles_[d.controleOnglets] = {};
  if (!d.onglets.empty()) onglet_ = d.onglets.front().nom;
}

Controle& Ecran::controle(const std::string& name) {
  auto it = controles_.find(name);
  if (it == controles_.end()) {
    throw UException("the screen " + description_->ecran + " has no control " + name);
  }
  return it->second;
}

const Controle* Ecran::trouver(const std::string& name) const {
  auto it = controles_.find(name);
  return it == controles_.end() ? nullptr : &it->second;
}

bool Ecran::accessible(const std::string& name) const {
  const Controle* c = trouver(name);
  if (c == nullptr || !c->actif || !c->visible) return false;
  std::string tab;
  if (const DescChamp* f = description_->champ(name)) tab = f->onglet;
  if (const DescBouton* b = description_->bouton(name)) tab = b->onglet;
  if (const DescListe* l = description_->liste(name)) tab = l->onglet;
  if (!tab.empty() && tab != onglet_) return false;
  if (const DescChamp* f = description_->champ(name); f && !f->groupe.empty()) {
    const Controle* g = trouver(f->groupe);
    if (g != nullptr && (!g->actif || !g->visible)) return false;
  }
  return true;
}

void Ecran::focus(const std::string& name) {
  if (!name.empty()) controle(name);
  focus_ = name;
}

void Ecran::selectionnerOnglet(const std::string& name) {
  if (description_->onglet(name) == nullptr) {
    throw UException("the screen " + description_->ecran + " has no tab " + name);
  }
  onglet_ = name;
}

ListeEcran& Ecran::liste(const std::string& name) {
  auto it = listes_.find(name);
  if (it == listes_.end()) {
    throw UException("the screen " + description_->ecran + " has no list " + name);
  }
  return it->second;
}

const ListeEcran* Ecran::trouverListe(const std::string& name) const {
  auto it = listes_.find(name);
  return it == listes_.end() ? nullptr : &it->second;
}

}  // namespace quarvo::host
