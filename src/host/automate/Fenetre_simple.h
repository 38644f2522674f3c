// A plain window: created with its parameters, it runs "INIT" and "DEBUT" (when bound) and then
// stays open in its session, its screen model (`ecran()`) showing its controls, until a handler
// ends it with `sortir`. Whoever drives the screen (a UI driver, a test) finds the open window
// with `Session::fenetre` and raises its events ("VALIDATION", a button's label, ...).
#pragma once

#include "host/automate/Automate.h"

namespace quarvo::host {

class Fenetre_simple : public Automate {
 public:
  using Automate::Automate;
  bool estFenetre() const override { return true; }
  void executer(Evt* evt) override;
};

}  // namespace quarvo::host
