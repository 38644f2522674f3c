#include "host/ui/ScriptedDriver.h"

#include <charconv>

namespace quarvo::host {

std::string buttonText(const std::string& button) {
  auto tilde = button.find('~');
  return tilde == std::string::npos ? button : button.substr(tilde + 1);
}

namespace {
std::string joinButtons(const std::vector<std::string>& buttons) {
  std::string out;
  for (const auto& b : buttons) out += "[" + buttonText(b) + "]";
  return out;
}

// An answer is a button number ("2") or a button's text ("Oui").
int answerIndex(const std::string& answer, const std::vector<std::string>& buttons) {
  int n = 0;
  auto [p, ec] = std::from_chars(answer.data(), answer.data() + answer.size(), n);
  if (ec == std::errc() && p == answer.data() + answer.size() && n >= 1 &&
      n <= static_cast<int>(buttons.size())) {
    return n;
  }
  for (size_t i = 0; i < buttons.size(); ++i) {
    if (buttonText(buttons[i]) == answer) return static_cast<int>(i) + 1;
  }
  return static_cast<int>(buttons.size());
}
}  // namespace

std::optional<std::string> ScriptedDriver::next() {
  if (answers_.empty()) return std::nullopt;
  std::string a = answers_.front();
  answers_.pop_front();
  return a;
}

std::string ScriptedDriver::transcriptText() const {
  std::string out;
  for (const auto& line : transcript_) out += line + "\n";
  return out;
}

int ScriptedDriver::boiteDialogue(const std::string& title, const std::string& text, int,
                                  const std::vector<std::string>& buttons) {
  auto answer = next();
  int chosen = buttons.empty() ? 1
               : answer        ? answerIndex(*answer, buttons)
                               : static_cast<int>(buttons.size());
  transcript_.push_back("MESSAGE " + title + " | " + text + " | " + joinButtons(buttons) +
                        (buttons.size() > 1 ? " -> " + std::to_string(chosen) : ""));
  return chosen;
}

std::optional<std::string> ScriptedDriver::choisirFichier(const std::string& title,
                                                          const std::string& filter) {
  auto answer = next();
  transcript_.push_back("FICHIER " + title + " (" + filter + ") -> " + answer.value_or(""));
  return answer;
}

std::optional<int> ScriptedDriver::choisir(const std::string& title,
                                           const std::vector<std::string>& items) {
  auto answer = next();
  transcript_.push_back("CHOIX " + title + " (" + std::to_string(items.size()) + ") -> " +
                        answer.value_or(""));
  if (!answer) return std::nullopt;
  int n = 0;
  std::from_chars(answer->data(), answer->data() + answer->size(), n);
  if (n < 1 || n > static_cast<int>(items.size())) return std::nullopt;
  return n;
}

void ScriptedDriver::attenteTitre(const std::string& title) {
  transcript_.push_back("ATTENTE " + title);
}
void ScriptedDriver::attenteLibelle(const std::string& text) {
  transcript_.push_back("LIBELLE " + text);
}
void ScriptedDriver::attenteJauge(int64_t done, int64_t total) {
  std::string line = "JAUGE " + std::to_string(done) + "/" + std::to_string(total);
  if (gaugeDetail_ || lastGauge_.empty()) transcript_.push_back(line);
  lastGauge_ = line;
}
void ScriptedDriver::attenteFin() {
  if (!gaugeDetail_ && !lastGauge_.empty() && transcript_.back() != lastGauge_) {
    transcript_.push_back(lastGauge_);
  }
  lastGauge_.clear();
  transcript_.push_back("FIN ATTENTE");
}
void ScriptedDriver::incident(const std::string& text) {
  transcript_.push_back("INCIDENT " + text);
}

}  // namespace quarvo::host
