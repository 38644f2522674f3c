// Evaluation of column references known only at run time: "I_GAPECOM.NUMERO_DOC" (an interface
// record of the session) or "CTX_GAPEFAC.TYPE" (a cursor of the automaton, by context or table
// name); a bare name is a field of the automaton.
#pragma once

#include <optional>
#include <string>

#include "host/value/Valeur.h"

namespace quarvo::host {

class Automate;

class Execute {
 public:
  // The value, or nullopt when nothing of that name exists.
  static std::optional<Valeur> execute(Automate& automate, const std::string& expression);
};

}  // namespace quarvo::host
