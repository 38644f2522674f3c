#include "quarvo/report/Libelles.h"

namespace quarvo::report {

std::string prefixeChapitre(const std::string& chapitre) {
  if (chapitre.empty()) return {};
  return chapitre.back() == ')' ? chapitre + " " : chapitre + ") ";
}

std::string legendeOrigine(const std::string& piece, const std::string& origine,
                           const std::string& libDevis, const std::string& libCommande) {
  if (piece == "MANUEL") return {};
  if (origine == "GCPEDEV") return libDevis + " ";
  if (origine == "GCPECOM") return libCommande + " ";
  return {};
}

}  // namespace quarvo::report
