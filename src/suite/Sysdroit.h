// "SYSDROIT": the users' rights on the applications.
//
// Rule: "LECTURE_DROITS_COURANTS" (application identifier) reads the "SYSDROIT" row of that
// application ("SYSAPPLI_IDENT") for the session's user ("UTILISATEUR") into "I_SYSDROIT"; it
// fails when the user has no row. Its "DROITS" text holds one letter per right ("V" see,
// "C" create/impute, "M" modify, "A" cancel, "I" print, "S" delete). "COMPARE_DROIT" (requested
// modes by reference, rights text, screen) narrows the requested modes to the letters the rights
// hold, compared without case ("VMCAv" with rights "VI" gives "Vv"); it fails when nothing is
// left.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Sysdroit : public TableInterface {
 public:
  explicit Sysdroit(host::Evt* evt);

 private:
  void lectureDroitsCourants(host::Evt* evt);
  void compareDroit(host::Evt* evt);
};

}  // namespace quarvo::suite
