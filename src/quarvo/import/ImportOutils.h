// Small helpers shared by the import automata: numbers read from text, the company's current
// month. (Characters of a text are counted by the runtime's host/Texte.h.)
#pragma once

#include <charconv>
#include <cstdint>
#include <string>

#include "host/value/Date.h"

namespace quarvo::import {

inline int64_t enNombre(const std::string& text) {
  int64_t n = 0;
  std::from_chars(text.data(), text.data() + text.size(), n);
  return n;
}

// Last day of the month of a "mmyyyy" period ("122026" gives 31/12/2026); empty when the
// period does not read as one.
inline host::Date finDuMois(const std::string& moisAnnee) {
  if (moisAnnee.size() < 6) return host::Date();
  std::string text = "01/" + moisAnnee.substr(0, 2) + "/" + moisAnnee.substr(moisAnnee.size() - 4);
  auto d = host::Date::parse(text);
  return d ? d->lastOfMonth() : host::Date();
}

}  // namespace quarvo::import
