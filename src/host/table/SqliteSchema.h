// What the schema of an SQLite file says about its tables, as the store needs it.
//
// Internal to the SQLite store (src/host/table). For a table: its columns and key, which
// columns an update may hold in memory (no write of them can fail), and which updates fire a
// trigger. SqliteSchema reads sqlite_master and the table pragmas through the connection's
// statements, which it borrows; the descriptions it returns are plain values owned by the
// caller.
#pragma once

#include <string>
#include <vector>

#include "host/table/Store.h"

namespace quarvo::host {

class SqliteStatements;

struct DescriptionTable {
  TableSchema schema;              // no columns when the file has no such table
  std::vector<bool> differables;   // columns whose update may wait in memory
  std::vector<bool> declencheurs;  // columns whose update fires a trigger
  bool declencheTout = false;      // some trigger fires on any update
  bool aDesDeclencheurs = false;   // the table has triggers of any kind
};

class SqliteSchema {
 public:
  explicit SqliteSchema(SqliteStatements& statements) : statements_(statements) {}

  DescriptionTable decrire(const std::string& table);
  // Every table of the file, by name.
  std::vector<std::string> tables();

 private:
  void noterDifferables(const std::string& table, DescriptionTable& d);
  static void noterDeclencheur(std::string sql, DescriptionTable& d);

  SqliteStatements& statements_;
};

}  // namespace quarvo::host
