#include "host/ui/ScriptedDriver.h"

namespace quarvo::host {

namespace {
std::string joinButtons(const std::vector<std::string>& buttons) {
  std::string out;
  for (const auto& b : buttons) out += "[" + buttonText(b) + "]";
  return out;
}
}  // namespace

std::string ScriptedDriver::transcriptText() const {
  std::string out;
  for (const auto& line : transcript_) out += line + "\n";
  return out;
}

int ScriptedDriver::boiteDialogue(const std::string& title, const std::string& text, int,
                                  const std::vector<std::string>& buttons) {
  auto answer = answers_.suivante();
  int chosen = buttons.empty() ? 1 : Reponses::bouton(answer, buttons);
  transcript_.push_back("MESSAGE " + title + " | " + text + " | " + joinButtons(buttons) +
                        (buttons.size() > 1 ? " -> " + std::to_string(chosen) : ""));
  return chosen;
}

std::optional<std::string> ScriptedDriver::choisirFichier(const std::string& title,
                                                          const std::string& filter) {
  auto answer = answers_.suivante();
  transcript_.push_back("FICHIER " + title + " (" + filter + ") -> " + answer.value_or(""));
  return answer;
}

std::optional<int> ScriptedDriver::choisir(const std::string& title,
                                           const std::vector<std::string>& items) {
  auto answer = answers_.suivante();
  transcript_.push_back("CHOIX " + title + " (" + std::to_string(items.size()) + ") -> " +
                        answer.value_or(""));
  return Reponses::element(answer, items.size());
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
