// A database that holds every persistent table of every base ("VOVOVA", "GESCOM", ...).
//
// Base names are namespaces of the suite; table names are unique across bases, so one database
// holds them all and one transaction covers pieces, budget lines and links together. The
// database owns the stores of its tables; cursors borrow them. Transactions nest: an inner
// Transaction is a savepoint of the outer one.
#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

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
};

// Begins in its constructor, rolls back in its destructor unless commit() ran.
class Transaction {
 public:
  explicit Transaction(Database& db) : db_(db) { db_.begin(); }
  ~Transaction() {
    if (!done_) db_.rollback();
  }
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  // REQUIRES: not committed yet (a second commit is a runtime fault).
  void commit();

 private:
  Database& db_;
  bool done_ = false;
};

}  // namespace quarvo::host
