// How a command that asked for a job drives a screen through the screen model: it types into
// the screen's fields and presses its buttons as a person would (their handlers run), what the
// screen says goes to the terminal as it comes, and each question is answered by the terminal
// driver (the command line's --answer, by the answer rule: none left, the last button).
#pragma once

#include <string>

#include "host/ui/ModeleEcran.h"

namespace quarvo::app {

class PiloteEcran {
 public:
  // `terminal` prints and answers; it is the session's driver before the model replaced it.
  PiloteEcran(host::ModeleEcran& model, host::UiDriver& terminal)
      : model_(model), terminal_(terminal) {}

  // Plays `action`, then answers the questions it asks. False when the screen refused it.
  bool jouer(const host::Action& action);
  // Types `value` into `field` unless it shows that value already (a person leaves a field
  // alone that says what they want).
  bool saisir(const std::string& field, const std::string& value);
  bool presser(const std::string& button);

  // The value `field` of the innermost window shows; empty when there is none.
  std::string valeur(const std::string& field) const;
  bool actif(const std::string& field) const;
  // Whether a window is open.
  bool ouverte() const { return !model_.etat().fenetres.empty(); }
  // The text of the last refusal.
  std::string refus() const;

 private:
  host::ModeleEcran& model_;
  host::UiDriver& terminal_;
};

}  // namespace quarvo::app
