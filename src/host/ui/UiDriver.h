// What needs a person: message boxes, file choosers, choice lists, waiting boxes.
//
// The session owns no driver; whoever opens the session (the command line, a test) owns it and
// keeps it alive as long as the session. Buttons are given as the runtime writes them ("$1~OK",
// "$2~Annuler"); answers are 1-based button or item numbers.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace quarvo::host {

class UiDriver {
 public:
  virtual ~UiDriver() = default;
  virtual int boiteDialogue(const std::string& title, const std::string& text, int icon,
                            const std::vector<std::string>& buttons) = 0;
  virtual std::optional<std::string> choisirFichier(const std::string& title,
                                                    const std::string& filter) = 0;
  virtual std::optional<int> choisir(const std::string& title,
                                     const std::vector<std::string>& items) = 0;
  // Waiting box (progress of long work).
  virtual void attenteTitre(const std::string& title) = 0;
  virtual void attenteLibelle(const std::string& text) = 0;
  virtual void attenteJauge(int64_t done, int64_t total) = 0;
  virtual void attenteFin() = 0;
  // A runtime fault reported to the user (an exception in a handler, a missing automaton).
  virtual void incident(const std::string& text) = 0;
};

// "$1~OK" → "OK".
std::string buttonText(const std::string& button);

}  // namespace quarvo::host
