#include "host/ui/TerminalDriver.h"

namespace quarvo::host {

TerminalDriver::TerminalDriver(std::ostream& out, std::deque<std::string> answers,
                               bool interactiveBar)
    : out_(out), answers_(std::move(answers)), bar_(interactiveBar) {}

int TerminalDriver::boiteDialogue(const std::string& title, const std::string& text, int,
                                  const std::vector<std::string>& buttons) {
  if (drawn_) {
    out_ << "\n";
    drawn_ = false;
  }
  // A text of several lines (a list) goes under its title, indented.
  if (text.find('\n') == std::string::npos) {
    out_ << title << " : " << text << "\n";
  } else {
    out_ << title << " :\n";
    size_t start = 0;
    while (start <= text.size()) {
      size_t end = text.find('\n', start);
      if (end == std::string::npos) end = text.size();
      out_ << "   " << text.substr(start, end - start) << "\n";
      start = end + 1;
    }
  }
  if (buttons.size() <= 1) return 1;
  int chosen = Reponses::bouton(answers_.suivante(), buttons);
  out_ << "  -> " << buttonText(buttons[static_cast<size_t>(chosen) - 1]) << "\n";
  return chosen;
}

std::optional<std::string> TerminalDriver::choisirFichier(const std::string& title,
                                                          const std::string&) {
  auto answer = answers_.suivante();
  out_ << title << " -> " << answer.value_or("(aucun)") << "\n";
  return answer;
}

std::optional<int> TerminalDriver::choisir(const std::string& title,
                                           const std::vector<std::string>& items) {
  auto answer = answers_.suivante();
  out_ << title << " -> " << answer.value_or("(aucun)") << "\n";
  return Reponses::element(answer, items.size());
}

void TerminalDriver::attenteTitre(const std::string& title) {
  title_ = title;
  lastPercent_ = -1;
  if (!bar_) out_ << title << "\n";
}

// Without a terminal the text of each step is not printed: a batch over thousands of pieces
// would bury its messages under one line per piece; the gauge says how far it is.
void TerminalDriver::attenteLibelle(const std::string& text) {
  if (bar_) title_ = text;
}

void TerminalDriver::attenteJauge(int64_t done, int64_t total) {
  int percent = total > 0 ? static_cast<int>(done * 100 / total) : 100;
  if (percent == lastPercent_) return;
  lastPercent_ = percent;
  if (bar_) {
    int width = 30;
    int filled = percent * width / 100;
    out_ << "\r" << title_ << " [" << std::string(static_cast<size_t>(filled), '#')
         << std::string(static_cast<size_t>(width - filled), '.') << "] " << percent << "% ("
         << done << "/" << total << ")" << std::flush;
    drawn_ = true;
  } else if (percent % 25 == 0) {
    out_ << "  " << percent << "% (" << done << "/" << total << ")\n";
  }
}

void TerminalDriver::attenteFin() {
  if (drawn_) out_ << "\n";
  drawn_ = false;
  lastPercent_ = -1;
}

void TerminalDriver::incident(const std::string& text) {
  if (drawn_) out_ << "\n";
  drawn_ = false;
  out_ << "Incident : " << text << "\n";
}

}  // namespace quarvo::host
