// A database that holds every persistent table of every base ("VOVOVA", "GESCOM", ...).
//
// Base names are namespaces of the suite; table names are unique across bases, so one database
// holds them all and one transaction covers pieces, budget lines and links together. The
// database owns the stores of its tables; cursors borrow them. Transactions nest: an inner
// Transaction is a savepoint of the outer one. A Lecture reads one moment without stopping
// other writers; a join (see Jointure.h) is run by the database in one statement.
#pragma once

#include <chrono>
#include <filesystem>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/table/Jointure.h"
#include "host/table/Store.h"

namespace quarvo::host {

class Database {
 public:
  virtual ~Database() = default;
  // The store of a persistent table, or null when the database has no such table.
  virtual TableStore* store(const std::string& table) = 0;
  virtual std::vector<std::string> tableNames() = 0;
  virtual void execScript(const std::string& sql) = 0;
  virtual const std::filesystem::path& path() const = 0;

  // Nested transactions (savepoints). Prefer the RAII Transaction below.
  virtual void begin() = 0;
  virtual void commit() = 0;
  virtual void rollback() = 0;
  virtual int depth() const = 0;

  // A read of one moment (prefer the RAII Lecture below). From its first read to
  // finirLecture, every read sees the database as it was then, whatever other connections
  // commit meanwhile, and it takes no lock that would make them wait. Inside a transaction it
  // is part of that transaction. REQUIRES: nothing written until finirLecture (a transaction
  // begun inside a read that is not part of one is a runtime fault).
  virtual void commencerLecture() = 0;
  virtual void finirLecture() = 0;
  // Runs a join (see Jointure.h). Throws UException for an unknown table or column.
  virtual std::unique_ptr<CurseurJoint> joindre(const Jointure& jointure) = 0;
  // A mark of the data held: it changes whenever rows are written, by another program
  // (`autres`) or through this connection (`miennes`). Two equal marks say that nothing was
  // written in between.
  struct Marque {
    int64_t autres = -1;
    int64_t miennes = -1;
    bool operator==(const Marque&) const = default;
  };
  virtual Marque marque() = 0;
};

// Begins a read of one moment in its constructor and ends it in its destructor.
class Lecture {
 public:
  explicit Lecture(Database& db) : db_(db) { db_.commencerLecture(); }
  ~Lecture() {
    try {
      db_.finirLecture();
    } catch (...) {
      // Nothing was written: the connection drops the read itself on its next statement.
    }
  }
  Lecture(const Lecture&) = delete;
  Lecture& operator=(const Lecture&) = delete;

 private:
  Database& db_;
};

// Begins in its constructor, rolls back in its destructor unless commit() ran.
class Transaction {
 public:
  explicit Transaction(Database& db) : db_(db) { db_.begin(); }
  ~Transaction() {
    if (done_) return;
    try {
      db_.rollback();
    } catch (...) {
      // Unwinding from a fault: the connection's own rollback (on close or on its next
      // statement) undoes what this one could not.
    }
  }
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  // REQUIRES: not committed yet (a second commit is a runtime fault).
  void commit();

 private:
  Database& db_;
  bool done_ = false;
};

// Groups the many small units of a long batch into few commits.
//
// Each unit keeps its own Transaction, which inside the group is a savepoint: a unit is still
// written whole or not at all. The group commits once `unites` units have ended or `delai` has
// passed, whichever comes first, so the pages every unit touches (counters, budget lines,
// indexes) are written once per group instead of once per unit, and other writers wait at most
// about `delai` for the lock. A crash loses the units ended since the last group commit, never
// part of one: a batch that skips what already exists simply writes them again on its rerun.
// The group is open from construction until terminer(); the destructor rolls back what an
// unfinished group holds.
class TransactionsGroupees {
 public:
  explicit TransactionsGroupees(Database& db, int unites = 500,
                                std::chrono::milliseconds delai = std::chrono::milliseconds(200));
  TransactionsGroupees(const TransactionsGroupees&) = delete;
  TransactionsGroupees& operator=(const TransactionsGroupees&) = delete;
  // Called after a unit's own transaction committed or rolled back; may commit the group and
  // open the next one: true when it did (every unit ended so far is then in the database).
  // REQUIRES: terminer() has not run.
  bool uniteTerminee();
  // Commits what the group holds and closes it. Idempotent.
  void terminer();

 private:
  using Clock = std::chrono::steady_clock;
  Database& db_;
  int unites_;
  std::chrono::milliseconds delai_;
  int ouvertes_ = 0;
  Clock::time_point debut_;
  std::optional<Transaction> groupe_;
};

}  // namespace quarvo::host
