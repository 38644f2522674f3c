// Small text helpers shared by the import automata: numbers read from text, characters of a text
// counted as characters (not bytes), the company's current month.
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

// Byte offsets of the UTF-8 characters of `s` (plus its size at the end).
inline std::string derniersCaracteres(const std::string& s, size_t count) {
  size_t chars = 0;
  for (unsigned char c : s) chars += (c & 0xC0) != 0x80 ? 1 : 0;
  if (chars <= count) return s;
  size_t skip = chars - count;
  size_t i = 0;
  while (i < s.size()) {
    if ((static_cast<unsigned char>(s[i]) & 0xC0) != 0x80) {
      if (skip == 0) break;
      --skip;
    }
    ++i;
  }
  return s.substr(i);
}

// Characters `from` to `to` (1-based, inclusive) of `s`, as the 4GL's substring.
inline std::string caracteres(const std::string& s, size_t from, size_t to) {
  std::string out;
  size_t index = 0;
  for (size_t i = 0; i < s.size(); ++i) {
    if ((static_cast<unsigned char>(s[i]) & 0xC0) != 0x80) ++index;
    if (index >= from && index <= to) out += s[i];
  }
  return out;
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
