// The screen state of one open window: what its screen shows besides the values of its fields.
//
// Built from the screen's description when the window first touches its screen, owned by the
// window's automaton. It keeps per control (field, button, tab, list, group) whether it is
// enabled and visible, the focus, the current tab, each list's rows and current row, the title,
// the mode and whether the window holds changes not saved yet. Field values are not copied
// here: the screen shows the automaton's field of the same name, as it is when drawn.
//
// A handler that names a control its description does not declare gets a UException (reported
// with the handler's label by the dispatch guard): a misspelt control is a fault to fix, never a
// new control nobody sees.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "host/ui/Description.h"

namespace quarvo::host {

struct Controle {
  bool actif = true;
  bool visible = true;
};

struct ListeEcran {
  std::vector<std::vector<std::string>> lignes;  // one text per column, in column order
  size_t courante = 0;                           // from 1; 0 when no row is current
};

class Ecran {
 public:
  explicit Ecran(std::shared_ptr<const DescriptionEcran> description);

  const DescriptionEcran& description() const { return *description_; }

  // REQUIRES: `name` is declared (else UException).
  Controle& controle(const std::string& name);
  // Null when `name` is not declared.
  const Controle* trouver(const std::string& name) const;
  // Whether a person can act on the control now: enabled and visible, and on the current tab
  // (or on none).
  bool accessible(const std::string& name) const;

  // An empty name puts the focus on no control.
  void focus(const std::string& name);
  const std::string& focus() const { return focus_; }

  // The current tab; empty when the screen has none.
  const std::string& onglet() const { return onglet_; }
  // REQUIRES: `name` is a tab of the screen.
  void selectionnerOnglet(const std::string& name);

  // REQUIRES: `name` is a list of the screen.
  ListeEcran& liste(const std::string& name);
  const ListeEcran* trouverListe(const std::string& name) const;

  const std::string& titre() const { return titre_; }
  void setTitre(std::string titre) { titre_ = std::move(titre); }
  const std::string& mode() const { return mode_; }
  void setMode(std::string mode) { mode_ = std::move(mode); }
  bool nonEnregistre() const { return nonEnregistre_; }
  void setNonEnregistre(bool flag) { nonEnregistre_ = flag; }

 private:
  std::shared_ptr<const DescriptionEcran> description_;
  std::map<std::string, Controle> controles_;
  std::map<std::string, ListeEcran> listes_;
  std::string focus_;
  std::string onglet_;
  std::string titre_;
  std::string mode_;
  bool nonEnregistre_ = false;
};

}  // namespace quarvo::host
