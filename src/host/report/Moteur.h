// The report engine: prints a layout (see Etat.h) for an automaton into a PDF document.
#pragma once

#include <filesystem>
#include <string>

#include "host/report/Etat.h"

namespace quarvo::host {
class Automate;
}

namespace quarvo::host::report {

class Moteur {
 public:
  Moteur(Automate& automate, const Etat& etat) : automate_(automate), etat_(etat) {}
  // Composes and writes the report; false with the reason in `error`.
  bool imprimer(const std::filesystem::path& file, std::string& error);
  int pages() const { return pages_; }

 private:
  Automate& automate_;
  const Etat& etat_;
  int pages_ = 0;
};

}  // namespace quarvo::host::report
