// The text form of the suite's row identifiers ("IDENT") and error numbers: the number padded
// with zeros to a fixed width, ten unless the numbering says otherwise, so that the order of
// the texts is the order of the numbers.
#pragma once

#include <cstdint>
#include <string>

namespace quarvo::host {

// "0000000042" for 42.
inline std::string identifiant(int64_t n, int largeur = 10) {
  std::string digits = std::to_string(n);
  if (static_cast<int>(digits.size()) < largeur) {
    digits.insert(0, static_cast<size_t>(largeur) - digits.size(), '0');
  }
  return digits;
}

}  // namespace quarvo::host
