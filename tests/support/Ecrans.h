// Playing actions on the screen model in a test: one line back per action, saying whether it
// was accepted, its refusal, the messages shown and the pending dialog, so that a test reads as
// the transcript of what a person did and saw.
#pragma once

#include <string>

#include "host/ui/ModeleEcran.h"

namespace quarvo::test {

// Plays one script line ("set VDATEMAX 32/13/2026"); "ok" or "refused on CONTROL: text" ("refused:
// text" when no control is concerned), then " | message" for each message and " | dialog TITLE:
// BUTTONS" when one is pending.
std::string jouer(host::ModeleEcran& modele, const std::string& line);
// The value of `field` in the innermost window; "(absent)" when it has no such field.
std::string champ(const host::ModeleEcran& modele, const std::string& field);
// Whether `control` (a field or a button) of the innermost window is enabled and visible.
bool actif(const host::ModeleEcran& modele, const std::string& control);

}  // namespace quarvo::test
