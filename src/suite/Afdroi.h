// "AFDROI": which projects a user may see.
//
// Rule: "CONTROLER_DROITS_AFAFFA" (project code, establishment code, department code, period)
// succeeds when the session's user has no "AFDROI" row at all (no restriction), or has a row
// whose "AFETAB_CODE" and "AFSERV_CODE" each equal the project's or are empty (empty stands
// for all). Otherwise it fails: the user may not see the project. The period is not used.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Afdroi : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Afdroi(host::Evt* evt);

 private:
  void controlerDroitsAfaffa(host::Evt* evt);
};

}  // namespace quarvo::suite
