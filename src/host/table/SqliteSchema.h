// What the schema of an SQLite file says about its tables, as the store needs it.
//
// Internal to the SQLite store (src/host/table). For a table: its columns and key, which
// columns an update may hold in memory (no write of them can fail), which updates fire a
// trigger, and which tables its triggers may write, those the triggers they fire in turn
// write included. SqliteSchema reads sqlite_master and the table pragmas through the
// connection's statements, which it borrows, and keeps the triggers it read until the schema
// changes; the descriptions it returns are plain values owned by the caller.
#pragma once

#include <cstdint>
#include <string>
#include <unordered_map>
#include <utility>
#include <vector>

#include "host/table/SqliteDeclencheur.h"
#include "host/table/Store.h"

namespace quarvo::host {

class SqliteStatements;

// The tables a statement on some table may write through the triggers it fires.
struct CiblesDeclencheurs {
  bool toutes = false;              // a trigger not understood: any table
  std::vector<std::string> tables;  // upper case; the table itself when a trigger writes other
                                    // rows of it than the one that fired it
};

struct DescriptionTable {
  TableSchema schema;              // no columns when the file has no such table
  std::vector<bool> differables;   // columns whose update may wait in memory
  std::vector<bool> declencheurs;  // columns whose update fires a trigger
  bool declencheTout = false;      // some trigger fires on any update
  bool aDesDeclencheurs = false;   // the table has triggers of any kind
  CiblesDeclencheurs cibles;       // what its triggers may write
};

class SqliteSchema {
 public:
  explicit SqliteSchema(SqliteStatements& statements) : statements_(statements) {}

  DescriptionTable decrire(const std::string& table);
  // Every table of the file, by name.
  std::vector<std::string> tables();
  // The versions of the schemas "main" and "temp": they change with every change of a table,
  // an index or a trigger, on this connection or another. A description made under another
  // version may be wrong.
  using Version = std::pair<int64_t, int64_t>;
  Version version();

 private:
  void noterDifferables(const std::string& table, DescriptionTable& d);
  static void noterDeclencheur(std::string sql, DescriptionTable& d);
  // Reads the triggers of every table again when the schema changed since.
  void lireDeclencheurs();
  CiblesDeclencheurs cibles(const std::string& table) const;

  SqliteStatements& statements_;
  // Every trigger of the file, by the name of its table in upper case, as of `lus_`.
  Version lus_{-1, -1};
  std::unordered_multimap<std::string, Declencheur> declencheurs_;
};

}  // namespace quarvo::host
