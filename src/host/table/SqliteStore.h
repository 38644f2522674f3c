// A persistent table of the SQLite database: the TableStore behind every cursor on it.
//
// Internal to the SQLite store (src/host/table): callers reach it only as a TableStore through
// SqliteDatabase::store. It builds and runs the table's SQL (every value bound, identifiers from
// the schema), remembers reads and holds updates inside transactions in its MemoireTable (see
// SqliteMemoire.h for why), and asks its database to write or forget what other tables hold
// when a statement may fire a trigger. The database owns its stores and the statements they
// borrow; a store belongs to its database's thread.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "host/table/SqliteMemoire.h"
#include "host/table/SqliteSchema.h"
#include "host/table/SqliteStatements.h"

namespace quarvo::host {

class SqliteDatabase;

// Past every text that starts with `prefix`: "starts with" is the range [prefix, this), which an
// index on the column serves (texts compare bytewise, and valid UTF-8 has no byte above F4).
std::string apresLePrefixe(const std::string& prefix);
// The SQL of criterion `c` on column `col` of the table written `prefixe` ("" or "t1."), its
// values added to `binds`: as every selection of the store writes it.
std::string sqlCritere(const ColumnInfo& col, const std::string& prefixe, const Criterion& c,
                       std::vector<Valeur>& binds);

class SqliteStore : public TableStore {
 public:
  SqliteStore(SqliteDatabase& db, SqliteStatements& statements, std::string name,
              DescriptionTable description);

  bool exists() const { return !description_.schema.columns().empty(); }
  const std::string& name() const override { return name_; }
  TableSchema& schema() override { return description_.schema; }
  bool extensible() const override { return false; }

  std::vector<RowId> select(const std::vector<Criterion>& criteria) override;
  std::optional<std::vector<RowId>> selectTriee(const std::vector<Criterion>& criteria,
                                                const std::vector<std::string>& tri) override;
  bool fetch(RowId id, Row& out) override;
  std::shared_ptr<const Row> partagee(RowId id) override;
  RowId insert(const Row& row) override;
  void update(RowId id, const Row& row, const std::vector<bool>& changees) override;
  void remove(RowId id) override;
  int64_t removeAll(const std::vector<Criterion>& criteria) override;
  int64_t count(const std::vector<Criterion>& criteria) override;

  // Forgets every remembered selection and row; updates still held are written first.
  void oublier();
  // Writes the updates held in memory, one statement per row.
  void ecrireEnAttente();
  // Drops the updates held in memory: the savepoint they belong to is rolled back.
  void abandonnerEnAttente() { memoire_.abandonnerEnAttente(); }
  // Takes what the schema now says of the table's indexes and triggers. Its columns stay as
  // cursors know them: when they changed, every write is taken as one that may fire a trigger
  // writing any table. REQUIRES: nothing remembered or held (the schema just changed).
  void reapprendre(DescriptionTable description);

 private:
  std::vector<RowId> lireSelection(const std::vector<Criterion>& criteria,
                                   const std::string& ordre);
  bool lireLigne(RowId id, Row& out);
  // Column i of `row` in the column's kind, as it will be stored.
  Valeur ajustee(const Row& row, size_t i) const;
  void executerUpdate(RowId id, const Row& row, const std::vector<size_t>& ecrites);
  // Before a statement that writes this table; `declenche` when it may fire a trigger.
  void ecrireAvant(bool declenche);
  void step(sqlite3_stmt* st, const char* what);
  std::string where(const std::vector<Criterion>& criteria, std::vector<Valeur>& binds);
  void bindRow(sqlite3_stmt* st, const Row& row);
  void bindColumn(sqlite3_stmt* st, int n, const Row& row, size_t i);

  SqliteDatabase& db_;
  SqliteStatements& statements_;
  std::string name_;
  DescriptionTable description_;
  std::string order_;
  std::string fetchSql_;
  std::string insertSql_;
  std::string updateSql_;
  // Statements of this table, prepared once (the statement cache owns them).
  sqlite3_stmt* fetchSt_ = nullptr;
  sqlite3_stmt* insertSt_ = nullptr;
  std::map<std::vector<size_t>, sqlite3_stmt*> updates_;  // by the columns written
  // What was read inside transactions while no other connection changed the file (see
  // SqliteDatabase::memoireActive), and the updates held back.
  MemoireTable memoire_;
};

}  // namespace quarvo::host
