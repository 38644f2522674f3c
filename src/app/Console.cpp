#include "app/Console.h"

#include <algorithm>
#include <cctype>
#include <ostream>

#include "app/Workspace.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

namespace {

size_t displayWidth(const std::string& s) {
  return static_cast<size_t>(
      std::count_if(s.begin(), s.end(), [](char c) { return (c & 0xC0) != 0x80; }));
}

struct Kind {
  const char* table;
  const char* code;
};
constexpr Kind kKinds[] = {{"GAPECOM", "CF"}, {"GAPEBL", "BF"}, {"GAPEFAC", "FF"}};

}  // namespace

void printTable(std::ostream& out, const TextRow& heading, const std::vector<TextRow>& rows) {
  std::vector<size_t> width(heading.size(), 0);
  auto measure = [&](const TextRow& row) {
    for (size_t c = 0; c < width.size() && c < row.size(); ++c) {
      width[c] = std::max(width[c], displayWidth(row[c]));
    }
  };
  measure(heading);
  for (const auto& row : rows) measure(row);
  auto line = [&](const TextRow& row) {
    for (size_t c = 0; c < row.size(); ++c) {
      out << row[c];
      if (c + 1 < row.size()) out << std::string(width[c] - displayWidth(row[c]) + 2, ' ');
    }
    out << "\n";
  };
  line(heading);
  for (const auto& row : rows) line(row);
}

PieceArg findPiece(const std::string& kindText, const std::string& ident) {
  std::string kind = kindText;
  std::transform(kind.begin(), kind.end(), kind.begin(),
                 [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
  const Kind* found = nullptr;
  for (const auto& k : kKinds) {
    if (kind == k.table || kind == k.code) found = &k;
  }
  if (found == nullptr) {
    throw UsageError("unknown piece kind '" + kindText +
                     "': give GAPECOM, GAPEBL, GAPEFAC or CF, BF, FF");
  }
  Table header(nullptr, "GESCOM", found->table, "COMMANDE");
  if (header.chercher(3, "IDENT", '=', Valeur::chaine(ident)) != 0 &&
      header.chercher(3, "NUMERO_DOC", '=', Valeur::chaine(ident)) != 0) {
    throw UsageError(std::string("no ") + found->table + " piece has the identifier or number '" +
                     ident + "'");
  }
  return {found->table, header.valeur("IDENT").toChaine(), header.valeur("NUMERO_DOC").toChaine()};
}

}  // namespace quarvo::app
