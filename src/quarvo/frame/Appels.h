// Calls from the module's automata to the interface automata of other modules (and of the
// module itself), by name through the runtime, with the arguments by reference so that results
// come back into the caller's fields. Returns the callee's outcome (0 success, 1 failure), which
// the calling automaton can also ask with erreurMethode() right after.
#pragma once

#include <string>
#include <vector>

#include "host/automate/Automate.h"

namespace quarvo::frame {

int appeler(host::Automate& caller, const std::string& module, const std::string& label,
            std::vector<host::Arg> args = {});

// A new identifier for a row of `table` in `base` ("VOVOVA", "GESCOM") from the numbering service
// "ZUMNDOC": reserved ("ATTRIBUE_NUMERO"), then confirmed ("VALIDE_NUMERO"), ten digits, into
// `ident`. False when either call fails.
bool numeroter(host::Automate& caller, const std::string& base, const std::string& table,
               host::Field& ident);

// Shows message `number` of the catalogue through "COMMUN" "MESS_OK" (information) or
// "MESS_ON" (question); `answer` receives the button ("1" yes). Extra texts fill "%1", "%2".
void messageOk(host::Automate& caller, host::Field& answer, const std::string& number,
               std::vector<std::string> args = {});
bool messageOn(host::Automate& caller, host::Field& answer, const std::string& number,
               std::vector<std::string> args = {});

}  // namespace quarvo::frame
