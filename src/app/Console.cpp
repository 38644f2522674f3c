#include "app/Console.h"

#include <algorithm>
#include <cctype>
#include <ostream>

#include "app/Workspace.h"
#include "host/Texte.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

namespace {

struct Kind {
  const char* table;
  const char* code;
};
constexpr Kind kKinds[] = {{"GAPECOM", "CF"}, {"GAPEBL", "BF"}, {"GAPEFAC", "FF"}};

}  // namespace

void printTable(std::ostream& out, const TextRow& heading, const std::vector<TextRow>& rows) {
  std::vector<TextRow> all{heading};
  all.insert(all.end(), rows.begin(), rows.end());
  out << tableauAligne(all);
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
