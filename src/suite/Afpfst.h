// "AFPFST": the time pointing of personnel services, kept per link row ("AFPFST" table).
//
// Rule: "PURGER_QUARVO" (link identifier) deletes every pointing row of that link
// ("QUARVO_IDENT"); it succeeds also when there was none.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Afpfst : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Afpfst(host::Evt* evt);
};

}  // namespace quarvo::suite
