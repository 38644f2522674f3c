// The headless screen model: the truth of what a screen shows. Controls are found by name and
// carry their enabled and visible state and their value; the automaton changes them, a driver
// or a test reads them. Owned by its automaton.
#pragma once

#include <map>
#include <string>

#include "host/value/Valeur.h"

namespace quarvo::host {

struct Controle {
  bool actif = true;
  bool visible = true;
  Valeur valeur;
};

class Ecran {
 public:
  Controle& controle(const std::string& name) { return controls_[name]; }
  const std::map<std::string, Controle>& controles() const { return controls_; }
  void focus(const std::string& name) { focus_ = name; }
  const std::string& focus() const { return focus_; }

 private:
  std::map<std::string, Controle> controls_;
  std::string focus_;
};

}  // namespace quarvo::host
