// The interface automaton of a module: other modules call its procedures by label. Each call
// creates it, runs "INIT" (when bound) and then the label. Besides its own labels it answers
// "LECTURE" with a row identifier of its main table, leaving the row in the session's interface
// record "I_<table>".
#pragma once

#include "host/automate/Automate.h"

namespace quarvo::host {

class Interface2 : public Automate {
 public:
  explicit Interface2(Evt* creating);
  // The base-class answer to "LECTURE": reads row `IDENT` = parameter 0 of the main table.
  void lecture(Evt* evt);
};

}  // namespace quarvo::host
