// The "screen" command: a screen automaton worked through the screen model, from a script or at
// a prompt.
//
//   quarvo screen NAME [ARG...] [--script FILE|-] [--json]
//
// Opens NAME with the ARGs as its positional parameters (as "run" passes them), then plays the
// script's actions one per line (see host/ui/Action.h for the words) and prints the state after
// opening and after each action: stable text, or with --json one JSON object per line. Without
// --script, actions are read from the standard input: at a terminal, interactively (a prompt,
// the state redrawn after each action, a refused action does not end the session); otherwise
// as a script. At the end, every window still open is closed as a person would close it, a
// pending question getting its last button.
//
// Exit codes: 0 every action accepted; 1 the screen refused to open, or an action was refused
// (its refusal printed; the actions after it are not played); 2 a usage error: an unknown
// screen, an automaton that is not a screen, a script line that is not an action (named by its
// line number, before any action is played), --answer given (answers come from the script).
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

#include "host/session/Session.h"
#include "host/ui/ModeleEcran.h"

namespace quarvo::app {

// One action of a script, with its line for messages.
struct LigneScript {
  size_t numero;
  std::string texte;
  host::Action action;
};

// Every action of a script read before any is played (a script that does not read as actions
// changes nothing): a UsageError names the first line that is not an action. `file` "-" reads
// `standard`.
std::vector<LigneScript> lireScript(std::istream& in, const std::string& source);
std::vector<LigneScript> lireScript(const std::string& file, std::istream& standard);
// Prints a state as `screen` does: text, or one JSON object on a line.
void imprimerEtat(const host::EtatEcrans& etat, bool json, std::ostream& out);
// Plays the actions in order, printing the state after each (text mode names each action
// first); stops at the first refusal, which goes to `err` with its line: returns 1, else 0.
int jouerScript(host::ModeleEcran& model, const std::vector<LigneScript>& script, bool json,
                std::ostream& out, std::ostream& err);

struct ScreenOptions {
  std::string name;
  std::vector<std::string> args;
  // Set: the screen is the window this interface label opens (module, label), as a menu opens
  // it, with `args` as the label's parameters; `name` then only names it in messages.
  std::string module;
  std::string label;
  std::string script;  // a file, "-" for the standard input, empty: the standard input
  bool json = false;
};

int runScreen(host::Session& session, const ScreenOptions& options, std::istream& in,
              bool interactive, std::ostream& out, std::ostream& err);

// The "link" command: the link document of one budget line, opened through the module's
// interface label "GESTION" (its budget found from the line; modes narrowed by the user's
// rights), then worked as "screen" works a screen.
//
//   quarvo link LINE [--mode LETTERS] [--script FILE|-] [--json]
//
// Exit codes as "screen"; an unknown line is a usage error (2); a document that refuses to
// open (a line of a budget that cannot be read, no right) gives 1.
int runLink(host::Session& session, const std::string& line, const std::string& modes,
            ScreenOptions options, std::istream& in, bool interactive, std::ostream& out,
            std::ostream& err);

}  // namespace quarvo::app
