// A driver for tests and scripted runs: answers come from a queue, everything shown is written
// to a transcript, one line per event ("MESSAGE Attention | texte | [OK]", "GAUGE 3/10").
// Answers are taken by the rule of `Reponses`: with no answer queued, a dialog gets its last
// button (the refusal: "Non", "Annuler") and a chooser gets nothing.
#pragma once

#include "host/ui/UiDriver.h"

namespace quarvo::host {

class ScriptedDriver : public UiDriver {
 public:
  void repondre(std::string answer) { answers_.ajouter(std::move(answer)); }
  const std::vector<std::string>& transcript() const { return transcript_; }
  std::string transcriptText() const;
  void clear() { transcript_.clear(); }
  // Gauge lines are many; keep only the first and last of each waiting box when false.
  void setGaugeDetail(bool all) { gaugeDetail_ = all; }

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
  Reponses answers_;
  std::vector<std::string> transcript_;
  bool gaugeDetail_ = false;
  std::string lastGauge_;
};

}  // namespace quarvo::host
