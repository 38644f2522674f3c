// The embedded default database: one SQLite file for all bases.
//
// Column kinds come from the declared column types of the schema (see db/schema.sql): TEXT,
// INTEGER, REAL, DECIMAL_TEXT (exact decimal as canonical text), DATE_TEXT (ISO date, '' when
// none), TIME_TEXT, DECIMAL_LIST_TEXT and DATE_LIST_TEXT (values joined by ';'). Every value is
// bound as a parameter; identifiers are checked against the schema before they reach SQL text.
// Several processes may share one file: writers wait for each other (busy timeout).
#pragma once

#include <map>
#include <unordered_map>

#include "host/table/Database.h"

struct sqlite3;
struct sqlite3_stmt;

namespace quarvo::host {

class SqliteStore;

class SqliteDatabase : public Database {
 public:
  // Opens (and creates when `create`) the file. Throws UException when it cannot be opened.
  SqliteDatabase(const std::filesystem::path& path, bool create);
  ~SqliteDatabase() override;
  SqliteDatabase(const SqliteDatabase&) = delete;
  SqliteDatabase& operator=(const SqliteDatabase&) = delete;

  TableStore* store(const std::string& table) override;
  std::vector<std::string> tableNames() override;
  void execScript(const std::string& sql) override;
  const std::filesystem::path& path() const override { return path_; }
  void begin() override;
  void commit() override;
  void rollback() override;
  int depth() const override { return depth_; }

  // A prepared statement from the cache, reset and with its bindings cleared.
  sqlite3_stmt* prepare(const std::string& sql);
  sqlite3* handle() { return db_; }
  [[noreturn]] void fail(const std::string& what);

 private:
  std::filesystem::path path_;
  sqlite3* db_ = nullptr;
  int depth_ = 0;
  std::unordered_map<std::string, sqlite3_stmt*> statements_;
  std::map<std::string, std::unique_ptr<SqliteStore>> stores_;
};

}  // namespace quarvo::host
