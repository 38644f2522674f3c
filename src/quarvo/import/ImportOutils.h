// Small text helpers shared by the import automata: numbers read from text, characters of a text
// counted as characters (not bytes), the company's current month.
#pragma once

#include <charconv>
#include <cstdint>
#include <string>

#include "host/Texte.h"
#include "host/value/Date.h"

namespace quarvo::import {

inline int64_t enNombre(const std::string& text) {
  int64_t n = 0;
  std::from_chars(text.data(), text.data() + text.size(), n);
  return n;
}

// Characters of a text, counted as characters (the runtime's rule).
using host::caracteres;
using host::derniersCaracteres;

// Last day of the month of a "mmyyyy" period ("122026" gives 31/12/2026); empty when the
// period does not read as one.
inline host::Date finDuMois(const std::string& moisAnnee) {
  if (moisAnnee.size() < 6) return host::Date();
  std::string text = "01/" + moisAnnee.substr(0, 2) + "/" + moisAnnee.substr(moisAnnee.size() - 4);
  auto d = host::Date::parse(text);
  return d ? d->lastOfMonth() : host::Date();
}

}  // namespace quarvo::import
