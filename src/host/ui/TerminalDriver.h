// The command line's driver: messages are printed on stderr with their title; questions take
// the next answer given on the command line (--answer) by the rule of `Reponses`; the
// waiting box is a progress bar on stderr (redrawn in place on a terminal; otherwise its title
// and a line at each quarter).
#pragma once

#include <chrono>
#include <deque>
#include <ostream>

#include "host/ui/UiDriver.h"

namespace quarvo::host {

class TerminalDriver : public UiDriver {
 public:
  TerminalDriver(std::ostream& out, std::deque<std::string> answers, bool interactiveBar);

  int boiteDialogue(const std::string& title, const std::string& text, int icon,
                    const std::vector<std::string>& buttons) override;
  std::optional<std::string> choisirFichier(const std::string& title,
                                            const std::string& filter) override;
  std::optional<int> choisir(const std::string& title,
                             const std::vector<std::string>& items) override;
  void attenteTitre(const std::string& title) override;
  void attenteLibelle(const std::string& text) override;
  void attenteJauge(int64_t done, int64_t total) override;
  void attenteFin() override;
  void incident(const std::string& text) override;

 private:
  std::ostream& out_;
  Reponses answers_;
  bool bar_;
  std::string title_;
  int lastPercent_ = -1;
  bool drawn_ = false;
};

}  // namespace quarvo::host
