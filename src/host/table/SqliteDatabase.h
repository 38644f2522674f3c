// The embedded default database: one SQLite file for all bases.
//
// Column kinds come from the declared column types of the schema (see db/schema.sql): TEXT,
// INTEGER, REAL, DECIMAL_TEXT (exact decimal as canonical text), DATE_TEXT (ISO date, '' when
// none), TIME_TEXT, DECIMAL_LIST_TEXT and DATE_LIST_TEXT (values joined by ';'). An amount or
// a date stored in a form that does not read is a UException naming table, column and value;
// NULL and blank text are "no value". Every value is bound as a parameter; identifiers are
// checked against the schema before they reach SQL text. Several processes may share one file:
// writers wait for each other (busy timeout). A connection belongs to one thread.
//
// Inside a transaction, small selections and the rows they give are remembered per table and
// answered from memory when asked again: a batch looks up the same reference rows for every
// line. A write to a table forgets its selections (and the written row); a write that may fire
// a trigger also forgets every table the trigger's body (or a trigger it fires) may write, as
// read from the trigger's text, and every table when that text is not understood; a rollback or
// a script forgets everything; so does a new transaction when another connection committed
// meanwhile, and the triggers are read again when the schema changed. Outside transactions
// every read goes to the file. An update of a remembered row that fires
// no trigger and touches no key, index or checked column is held in that row until the
// transaction reaches its next savepoint or commit, or a statement may read the table; a
// rollback drops it (see SqliteStore::update).
//
// Committed pages go to the write-ahead log; a thread of the database, with a connection of its
// own, copies the log back into the file once it has grown past a threshold (see
// CheckpointEnFond), so that a long batch does not wait for those copies and their syncs.
#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <set>
#include <unordered_map>
#include <utility>

#include "host/table/Database.h"

struct sqlite3;
struct sqlite3_stmt;

namespace quarvo::host {

class SqliteStore;
class SqliteStatements;
class SqliteSchema;
struct CiblesDeclencheurs;
class CheckpointEnFond;

class SqliteDatabase : public Database {
 public:
  // Past this many pages in the write-ahead log, a commit asks the background thread to copy
  // the log into the file; past four times as many, the commit copies it itself.
  static constexpr int kPagesCheckpoint = 8192;

  // Opens (and creates when `create`) the file. Throws UException when it cannot be opened.
  // `pagesCheckpoint` is the threshold above (tests lower it).
  SqliteDatabase(const std::filesystem::path& path, bool create,
                 int pagesCheckpoint = kPagesCheckpoint);
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
  // A deferred transaction whose first read fixes the snapshot of the write-ahead log it
  // reads: other connections go on writing; it sees none of what they commit.
  void commencerLecture() override;
  void finirLecture() override;
  Marque marque() override;
  std::unique_ptr<CurseurJoint> joindre(const Jointure& jointure) override;
  // How long a statement waits for another connection's lock before it fails (30 s unless set).
  void delaiAttente(std::chrono::milliseconds delai);

  // The rows of one read-only SQL query (tools and tests that read what the tables hold), each
  // value as SQLite's text of it, NULL as empty text. `parametres` are bound to the query's
  // parameters in order. Runs on this connection, inside its open transaction if any, after
  // the updates the stores hold in memory are written. Throws UException when the text is not
  // one query that only reads, or when SQLite refuses it.
  std::vector<std::vector<std::string>> interroger(const std::string& sql,
                                                   const std::vector<Valeur>& parametres = {});
  // Copies of the log into the file done so far by the background thread.
  int64_t checkpointsEnFond() const;

 private:
  // The raw connection is the store's alone: a read through it would miss the updates the
  // stores hold in memory, a write would leave their memory stale. The table stores reach it
  // through the statements they are given, and the services below through friendship.
  friend class SqliteStore;
  // A prepared statement from the cache, reset (its parameters keep their last bindings).
  sqlite3_stmt* prepare(const std::string& sql);
  [[noreturn]] void fail(const std::string& what);
  // Reads may be answered from what the stores remember: only inside a transaction, where no
  // other connection can change the file.
  bool memoireActive() const { return depth_ > 0; }
  // Updates a store holds in memory inside a transaction (see SqliteStore::update): noted by
  // the store, written before the transaction changes level or a statement may read them,
  // dropped by a rollback.
  void noterEnAttente(SqliteStore* store);
  void ecrireEnAttente();
  // Forgets what the stores of the tables a trigger may write remember. REQUIRES: nothing
  // held (ecrireEnAttente ran).
  void oublierCibles(const CiblesDeclencheurs& cibles);
  // Closes the connection when the database goes.
  struct Fermeture {
    void operator()(sqlite3* db) const;
  };

  void executer(const std::string& sql);
  // Runs one cached statement that returns no rows.
  void pas(const std::string& sql);
  void oublierLectures();
  // Drops the updates held and forgets every read: the work they belong to is undone.
  void abandonnerMemoire();
  // After a script, or when another connection committed: when the schema changed, every
  // store learns its table's indexes and triggers again.
  void verifierSchema();
  // At the start of a transaction: forgets what was remembered when another connection
  // committed since the last one.
  void verifierVersion();
  static int surCommit(void* self, sqlite3* db, const char* base, int pages);

  std::filesystem::path path_;
  std::unique_ptr<sqlite3, Fermeture> db_;  // before the members that use it: closed last
  std::unique_ptr<SqliteStatements> statements_;
  std::unique_ptr<SqliteSchema> schema_;
  int pagesCheckpoint_;
  std::unique_ptr<CheckpointEnFond> checkpoint_;  // started by the first commit that needs it

  int depth_ = 0;
  int64_t dataVersion_ = -1;
  std::pair<int64_t, int64_t> versionSchema_{-1, -1};  // what the stores were described from
  std::unordered_map<std::string, std::unique_ptr<SqliteStore>> stores_;
  std::vector<SqliteStore*> enAttente_;  // stores holding updates not yet written
  // Per read of one moment begun, whether it opened the transaction (else it is part of one).
  std::vector<bool> lectures_;
  std::set<sqlite3_stmt*> jointuresEnCours_;  // cached join statements cursors are reading
};

}  // namespace quarvo::host
