#include "app/Tsv.h"

#include "app/Workspace.h"
#include "host/TexteTabule.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

namespace {

TableStore& persistentStore(Session& session, const std::string& table) {
  TableStore* store = Session::isMemoryName(table) ? nullptr : session.db().store(table);
  if (store == nullptr) throw UsageError("unknown table " + table);
  return *store;
}

}  // namespace

size_t loadTsv(Session& session, const std::string& table, std::istream& in,
               const std::string& source) {
  TableStore& store = persistentStore(session, table);
  std::string record;
  size_t lines = 0;
  if (!lireEnregistrementTsv(in, record, lines)) {
    throw UsageError(source + ": empty file, no header line");
  }
  auto header = cellulesTsv(record);
  for (const auto& name : header) {
    if (!store.schema().index(name)) {
      throw UsageError(source + ":1: table " + table + " has no column '" + name + "'");
    }
  }
  Transaction tx(session.db());
  Table cursor(nullptr, "VOVOVA", table, "CHARGEMENT");
  size_t lineNo = lines + 1;  // the line the next record starts on
  size_t loaded = 0;
  for (; lireEnregistrementTsv(in, record, lines); lineNo += lines) {
    if (record.empty()) continue;
    auto cells = cellulesTsv(record);
    std::string where = source + ":" + std::to_string(lineNo) + ": ";
    if (cells.size() != header.size()) {
      throw UsageError(where + std::to_string(cells.size()) + " values for " +
                       std::to_string(header.size()) + " columns");
    }
    cursor.preparer();
    for (size_t i = 0; i < cells.size(); ++i) {
      if (!cursor.ecrire(header[i], Valeur::chaine(cells[i]))) {
        const auto& col = store.schema().columns()[*store.schema().index(header[i])];
        throw UsageError(where + "column " + header[i] + ": '" + cells[i] + "' is not a valid " +
                         kindName(valueKindOf(col.kind)));
      }
    }
    if (cursor.inserer() != 0) {
      throw UsageError(where + "row refused by the database (duplicate key or missing value)");
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
  std::vector<std::string> cells;
  for (const auto& column : columns) cells.push_back(column.name);
  out << enregistrementTsv(cells) << "\n";
  size_t n = 0;
  cursor.ouvrir();
  while (cursor.lire(1) == 0) {
    cells.clear();
    for (const auto& column : columns) cells.push_back(cursor.valeur(column.name).toChaine());
    out << enregistrementTsv(cells) << "\n";
    ++n;
  }
  return n;
}

}  // namespace quarvo::app
