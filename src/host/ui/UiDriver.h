// What needs a person: message boxes, file choosers, choice lists, waiting boxes.
//
// The session owns no driver; whoever opens the session (the command line, a test) owns it and
// keeps it alive as long as the session. Buttons are given as the runtime writes them ("$1~OK",
// "$2~Annuler"); answers are 1-based button or item numbers.
#pragma once

#include <cstdint>
#include <deque>
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

// Answers given before they are asked for (a script, the command line's --answer), taken in
// order, by one rule whichever driver takes them:
// - a message box: an answer that is, whole, the number of a button chooses it ("2"); else an
//   answer that is a button's text chooses that button ("Oui"); an answer that names no button
//   ("2x", "peut-être"), like no answer at all, refuses: the last button;
// - a choice list: an answer that is, whole, the number of an item chooses it; anything else
//   chooses nothing;
// - a file chooser: the answer is the path.
class Reponses {
 public:
  explicit Reponses(std::deque<std::string> answers = {}) : answers_(std::move(answers)) {}
  void ajouter(std::string answer) { answers_.push_back(std::move(answer)); }
  // The next answer, taken from the queue; nothing when none is left.
  std::optional<std::string> suivante();
  // The button (1-based) that `answer` chooses among `buttons` (at least one).
  static int bouton(const std::optional<std::string>& answer,
                    const std::vector<std::string>& buttons);
  // The item (1-based) that `answer` chooses among `count`, if any.
  static std::optional<int> element(const std::optional<std::string>& answer, size_t count);

 private:
  std::deque<std::string> answers_;
};

}  // namespace quarvo::host
