// The prepared statements of one SQLite connection, and how values go in and out of them.
//
// Internal to the SQLite store (src/host/table): nothing above the store includes this header.
// SqliteStatements owns the connection's cache of prepared statements, one per SQL text, and
// finalizes them when it goes; callers borrow a statement for one use and reset it when done
// (Reset, ResetDelie). It does not own the connection, which must outlive it. The functions
// below bind values in their stored form and read result columns back in a column's kind.
// Like its connection, it belongs to one thread.
#pragma once

#include <sqlite3.h>

#include <string>
#include <unordered_map>
#include <vector>

#include "host/table/Store.h"

namespace quarvo::host {

class SqliteStatements {
 public:
  explicit SqliteStatements(sqlite3* db) : db_(db) {}
  ~SqliteStatements() { finaliser(); }
  SqliteStatements(const SqliteStatements&) = delete;
  SqliteStatements& operator=(const SqliteStatements&) = delete;

  // A prepared statement from the cache, reset (its parameters keep their last bindings).
  // Throws UException when the SQL does not prepare.
  sqlite3_stmt* prepare(const std::string& sql);
  // Finalizes every cached statement; statements handed out before are gone.
  void finaliser();
  // Throws UException: `what` followed by the connection's last error message.
  [[noreturn]] void fail(const std::string& what) const;
  sqlite3* handle() const { return db_; }

 private:
  sqlite3* db_;
  std::unordered_map<std::string, sqlite3_stmt*> statements_;
};

// Resets a borrowed statement when it goes. Bindings are left as they are: every use of a
// statement binds all its parameters again.
struct Reset {
  sqlite3_stmt* stmt;
  ~Reset() { sqlite3_reset(stmt); }
};

// The same for a statement whose texts were bound without a copy (SQLITE_STATIC): they belong
// to the row being written, so the bindings are cleared before that row can go away.
struct ResetDelie {
  sqlite3_stmt* stmt;
  ~ResetDelie() {
    sqlite3_reset(stmt);
    sqlite3_clear_bindings(stmt);
  }
};

// Finalizes a statement prepared outside the cache (one-off queries).
struct Finaliser {
  void operator()(sqlite3_stmt* st) const { sqlite3_finalize(st); }
};

// An identifier quoted for SQL text ("NAME", with inner quotes doubled).
// Throws the runtime fault for SQLite's result `rc` on `db`: BaseIndisponible when the database
// cannot be used at all (locked past the wait, read-only, full, failing, not a database), a plain
// UException otherwise. `what` names the statement.
[[noreturn]] void echecSqlite(sqlite3* db, int rc, const std::string& what);

std::string sqlIdent(const std::string& identifier);

// A value as its column kind stores it: amounts and dates become their canonical text.
Valeur storageForm(ColKind k, const Valeur& v);
// Binds a value to parameter i as it is (numbers as numbers, anything else as its text).
void bindValue(sqlite3_stmt* st, int i, const Valeur& v);
// Binds values to the parameters from `first` on.
void bindAll(sqlite3_stmt* st, const std::vector<Valeur>& values, int first);
// Binds a value of its column's kind as it is stored (see storageForm). With SQLITE_STATIC a
// text is bound without a copy: `v` must then stay alive until the statement has run, and the
// bindings be cleared after (ResetDelie).
void bindStored(sqlite3_stmt* st, int n, const Valeur& v, sqlite3_destructor_type texte);
// Reads column i of the current result row into `out`, in the kind `k`. NULL, and blank text
// where an amount or a date is stored, are "no value" (defaultOf). False, `out` unchanged, when
// the stored text is not of the kind: an amount, a date, or a list of them that does not read.
[[nodiscard]] bool readColumn(sqlite3_stmt* st, int i, ColKind k, Valeur& out);

}  // namespace quarvo::host
