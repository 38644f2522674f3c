#include "host/Texte.h"

#include <algorithm>

namespace quarvo::host {

namespace {

bool debutDeCaractere(char c) {
  return (static_cast<unsigned char>(c) & 0xC0) != 0x80;
}

// Byte offset where character `index` (0-based) of `text` starts; the size past the last.
size_t octetDuCaractere(std::string_view text, size_t index) {
  size_t seen = 0;
  for (size_t i = 0; i < text.size(); ++i) {
    if (!debutDeCaractere(text[i])) continue;
    if (seen == index) return i;
    ++seen;
  }
  return text.size();
}

}  // namespace

size_t nombreCaracteres(std::string_view text) {
  return static_cast<size_t>(std::count_if(text.begin(), text.end(), debutDeCaractere));
}

std::string caracteres(std::string_view text, size_t from, size_t to) {
  if (from == 0) from = 1;
  if (to < from) return {};
  size_t begin = octetDuCaractere(text, from - 1);
  size_t end = octetDuCaractere(text, to);
  return std::string(text.substr(begin, end - begin));
}

std::string derniersCaracteres(std::string_view text, size_t count) {
  size_t total = nombreCaracteres(text);
  if (total <= count) return std::string(text);
  return std::string(text.substr(octetDuCaractere(text, total - count)));
}

std::string apercu(std::string_view text, size_t count) {
  if (nombreCaracteres(text) <= count) return std::string(text);
  return std::string(text.substr(0, octetDuCaractere(text, count))) + "…";
}

std::string_view sansBlancs(std::string_view text) {
  while (!text.empty() && (text.front() == ' ' || text.front() == '\t')) text.remove_prefix(1);
  while (!text.empty() && (text.back() == ' ' || text.back() == '\t')) text.remove_suffix(1);
  return text;
}

std::string tableauAligne(const std::vector<std::vector<std::string>>& rows) {
  std::vector<size_t> width;
  for (const auto& row : rows) {
    if (width.size() < row.size()) width.resize(row.size(), 0);
    for (size_t c = 0; c < row.size(); ++c) {
      width[c] = std::max(width[c], nombreCaracteres(row[c]));
    }
  }
  std::string out;
  for (const auto& row : rows) {
    std::string line;
    for (size_t c = 0; c < row.size(); ++c) {
      line += row[c];
      if (c + 1 < row.size()) line += std::string(width[c] - nombreCaracteres(row[c]) + 2, ' ');
    }
    while (!line.empty() && line.back() == ' ') line.pop_back();
    out += line + "\n";
  }
  return out;
}

}  // namespace quarvo::host
