#include "host/ui/TerminalDriver.h"

#include <charconv>

namespace quarvo::host {

TerminalDriver::TerminalDriver(std::ostream& out, std::deque<std::string> answers,
                               bool interactiveBar)
    : out_(out), answers_(std::move(answers)), bar_(interactiveBar) {}

std::optional<std::string> TerminalDriver::next() {
  if (answers_.empty()) return std::nullopt;
  std::string a = answers_.front();
  answers_.pop_front();
  return a;
}

int TerminalDriver::boiteDialogue(const std::string& title, const std::string& text, int,
                                  const std::vector<std::string>& buttons) {
  if (drawn_) {
    out_ << "\n";
    drawn_ = false;
  }
  out_ << title << " : " << text << "\n";
  if (buttons.size() <= 1) return 1;
  int chosen = static_cast<int>(buttons.size());
  if (auto answer = next()) {
    int n = 0;
    auto [p, ec] = std::from_chars(answer->data(), answer->data() + answer->size(), n);
    if (ec == std::errc() && n >= 1 && n <= static_cast<int>(buttons.size())) chosen = n;
    for (size_t i = 0; i < buttons.size(); ++i) {
      if (buttonText(buttons[i]) == *answer) chosen = static_cast<int>(i) + 1;
    }
  }
  out_ << "  -> " << buttonText(buttons[static_cast<size_t>(chosen) - 1]) << "\n";
  return chosen;
}

std::optional<std::string> TerminalDriver::choisirFichier(const std::string& title,
                                                          const std::string&) {
  auto answer = next();
  out_ << title << " -> " << answer.value_or("(aucun)") << "\n";
  return answer;
}

std::optional<int> TerminalDriver::choisir(const std::string& title,
                                           const std::vector<std::string>& items) {
  auto answer = next();
  out_ << title << " -> " << answer.value_or("(aucun)") << "\n";
  if (!answer) return std::nullopt;
  int n = 0;
  std::from_chars(answer->data(), answer->data() + answer->size(), n);
  if (n < 1 || n > static_cast<int>(items.size())) return std::nullopt;
  return n;
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
