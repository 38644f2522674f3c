#include "host/ui/UiDriver.h"

#include <charconv>

namespace quarvo::host {

namespace {

// The whole of `text` as a number from 1 to `count`.
std::optional<int> numero(const std::string& text, size_t count) {
  int n = 0;
  auto [end, ec] = std::from_chars(text.data(), text.data() + text.size(), n);
  if (ec != std::errc() || end != text.data() + text.size()) return std::nullopt;
  if (n < 1 || static_cast<size_t>(n) > count) return std::nullopt;
  return n;
}

}  // namespace

std::string buttonText(const std::string& button) {
  auto tilde = button.find('~');
  return tilde == std::string::npos ? button : button.substr(tilde + 1);
}

std::optional<std::string> Reponses::suivante() {
  if (answers_.empty()) return std::nullopt;
  std::string a = std::move(answers_.front());
  answers_.pop_front();
  return a;
}

int Reponses::bouton(const std::optional<std::string>& answer,
                     const std::vector<std::string>& buttons) {
  int refus = static_cast<int>(buttons.size());
  if (!answer) return refus;
  if (auto n = numero(*answer, buttons.size())) return *n;
  for (size_t i = 0; i < buttons.size(); ++i) {
    if (buttonText(buttons[i]) == *answer) return static_cast<int>(i) + 1;
  }
  return refus;
}

std::optional<int> Reponses::element(const std::optional<std::string>& answer, size_t count) {
  if (!answer) return std::nullopt;
  return numero(*answer, count);
}

}  // namespace quarvo::host
