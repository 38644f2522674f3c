// "ACTION": the user preferences of the suite.
//
// Rule: "LIT_PREF" (automaton name, user code, value by reference) reads the "ACTPREF" row of
// that automaton and user with the empty key and hands back its "VALEUR"; with no row the
// value comes back empty (and the call still succeeds: having no preference is no fault).
// "ECRIT_PREF" (same parameters) writes the value into that row, creating it when needed.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Action : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Action(host::Evt* evt);

 private:
  void litPref(host::Evt* evt);
  void ecritPref(host::Evt* evt);
};

}  // namespace quarvo::suite
