#include "app/Tsv.h"

#include "app/Workspace.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

std::string escapeTsv(const std::string& value) {
  std::string out;
  for (char c : value) {
    switch (c) {
      case '\t':
        out += "\\t";
        break;
      case '\n':
        out += "\\n";
        break;
      case '\r':
        out += "\\r";
        break;
      case '\\':
        out += "\\\\";
        break;
      default:
        out += c;
    }
  }
  return out;
}

std::string unescapeTsv(const std::string& value) {
  std::string out;
  for (size_t i = 0; i < value.size(); ++i) {
    if (value[i] != '\\' || i + 1 == value.size()) {
      out += value[i];
      continue;
    }
    char n = value[++i];
    out += n == 't' ? '\t' : n == 'n' ? '\n' : n == 'r' ? '\r' : n;
  }
  return out;
}

namespace {

std::vector<std::string> splitTabs(const std::string& line) {
  std::vector<std::string> cells;
  size_t start = 0;
  while (true) {
    size_t tab = line.find('\t', start);
    cells.push_back(line.substr(start, tab == std::string::npos ? tab : tab - start));
    if (tab == std::string::npos) return cells;
    start = tab + 1;
  }
}

TableStore& persistentStore(Session& session, const std::string& table) {
  TableStore* store = Session::isMemoryName(table) ? nullptr : session.db().store(table);
  if (store == nullptr) throw UsageError("unknown table " + table);
  return *store;
}

}  // namespace

size_t loadTsv(Session& session, const std::string& table, std::istream& in,
               const std::string& source) {
  TableStore& store = persistentStore(session, table);
  std::string line;
  if (!std::getline(in, line)) throw UsageError(source + ": empty file, no header line");
  if (!line.empty() && line.back() == '\r') line.pop_back();
  auto header = splitTabs(line);
  for (const auto& name : header) {
    if (!store.schema().index(name)) {
      throw UsageError(source + ":1: table " + table + " has no column '" + name + "'");
    }
  }
  Transaction tx(session.db());
  Table cursor(nullptr, "VOVOVA", table, "CHARGEMENT");
  size_t lineNo = 1;
  size_t loaded = 0;
  while (std::getline(in, line)) {
    ++lineNo;
    if (!line.empty() && line.back() == '\r') line.pop_back();
    if (line.empty()) continue;
    auto cells = splitTabs(line);
    if (cells.size() != header.size()) {
      throw UsageError(source + ":" + std::to_string(lineNo) + ": " + std::to_string(cells.size()) +
                       " values for " + std::to_string(header.size()) + " columns");
    }
    cursor.preparer();
    for (size_t i = 0; i < cells.size(); ++i) {
      std::string value = unescapeTsv(cells[i]);
      if (!cursor.ecrire(header[i], Valeur::chaine(value))) {
        const auto& col = store.schema().columns()[*store.schema().index(header[i])];
        throw UsageError(source + ":" + std::to_string(lineNo) + ": column " + header[i] + ": '" +
                         value + "' is not a valid " + kindName(valueKindOf(col.kind)));
      }
    }
    if (cursor.inserer() != 0) {
      throw UsageError(source + ":" + std::to_string(lineNo) +
                       ": row refused by the database (duplicate key or missing value)");
    }
    ++loaded;
  }
  tx.commit();
  return loaded;
}

size_t dumpTsv(Session& session, const std::string& table,
               const std::vector<std::pair<std::string, std::string>>& where, std::ostream& out) {
  TableStore& store = persistentStore(session, table);
  Table cursor(nullptr, "VOVOVA", table, "EXPORT");
  cursor.effacerCriteres();
  for (const auto& [col, value] : where) {
    if (!store.schema().index(col))
      throw UsageError("table " + table + " has no column '" + col + "'");
    cursor.ajouterCritere(col, '=', Valeur::chaine(value));
  }
  const auto& columns = store.schema().columns();
  for (size_t i = 0; i < columns.size(); ++i) out << (i ? "\t" : "") << columns[i].name;
  out << "\n";
  size_t n = 0;
  cursor.ouvrir();
  while (cursor.lire(1) == 0) {
    for (size_t i = 0; i < columns.size(); ++i) {
      out << (i ? "\t" : "") << escapeTsv(cursor.valeur(columns[i].name).toChaine());
    }
    out << "\n";
    ++n;
  }
  return n;
}

}  // namespace quarvo::app
