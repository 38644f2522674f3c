// "AFAFFA": projects, whose codes are also the analytical sections quoted on purchasing pieces.
//
// Rule: "CONTROLER_SECAN" (table, piece number, piece date, section code, mode, object,
// message 1 by reference, message 2 by reference) decides whether a piece may be charged to
// the section. The section must name a project ("AFAFFA" row whose "CODE" is the section
// code); that project must not be closed (no "DATE_CLOTURE"); and the piece date must lie
// within the project's "DATE_DEBUT".."DATE_FIN" (a missing bound, or a piece without a date,
// does not refuse). The first broken condition fails the call: message 1 names the piece and
// the section ("Pièce CF26000001 : section analytique AFF009"), message 2 says why. On success
// both messages are emptied. The table, the mode ("1": a purchasing piece) and the object are
// not used by this stand-in. "LECTURE" and "LECTURE_CODE" read a project (generic).
// "CHOIX" (project identifier by reference, where the list starts) offers the projects in code
// order in a choice list; a choice sets the identifier and reads the project into "I_AFAFFA";
// nothing chosen reports outcome 2 and leaves the identifier.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Afaffa : public TableInterface {
 public:
  explicit Afaffa(host::Evt* evt);

 private:
  void choix(host::Evt* evt);
  // Why the project of `section` refuses a piece dated `date`; empty when it accepts it.
  static std::string refus(host::Table& project, const std::string& section,
                           const host::Date& date);
  void controlerSecan(host::Evt* evt);
};

}  // namespace quarvo::suite
