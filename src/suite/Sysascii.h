// "SYSASCII": text utilities of the suite.
//
// Rule: "REMPLACER" (text by reference, pattern, replacement) replaces every occurrence of the
// pattern in the text, left to right, without rescanning what was put in (so a replacement
// that contains the pattern does not loop). An empty pattern leaves the text as it is. It
// always succeeds. "CONVERSION_CHEMIN" (alias path, result by reference) gives the folder an
// alias stands for, ending with a separator: "[zumdev]" is the suite's data folder (the
// session's catalogue folder); any other text is given back as it is.
#pragma once

#include <string>

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Sysascii : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Sysascii(host::Evt* evt);

  static std::string remplacer(const std::string& text, const std::string& pattern,
                               const std::string& replacement);

 private:
  void remplacer(host::Evt* evt);
  void conversionChemin(host::Evt* evt);
};

}  // namespace quarvo::suite
