// A treatment without a data-entry screen: created with parameters, it does its work in "FAIRE"
// (or in named procedures) and ends itself. Driven: "INIT", "DEBUT", then "FAIRE", each when
// bound, unless it ended before.
#pragma once

#include "host/automate/Automate.h"

namespace quarvo::host {

class Traitmnt : public Automate {
 public:
  using Automate::Automate;
  void executer(Evt* evt) override;
};

}  // namespace quarvo::host
