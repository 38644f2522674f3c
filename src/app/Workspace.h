// Opening a QUARVO database for the command line: creating the schema, seeding the demo data,
// refusing files that are not QUARVO databases, and the session that runs on it.
//
// A Workspace owns the database connection; the caller owns the UI driver and keeps it alive
// as long as the workspace's session.
#pragma once

#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>

#include "host/session/Session.h"
#include "host/table/SqliteDatabase.h"

namespace quarvo::app {

// An environment or usage error: one readable line, exit code 2.
class UsageError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// The folder of the schema, catalogues and demo files.
std::filesystem::path dataDir();

class Workspace {
 public:
  // Opens an existing QUARVO database. Throws UsageError when the file is missing, unreadable
  // or not a QUARVO database.
  static std::unique_ptr<Workspace> open(const std::filesystem::path& file);
  // Creates the schema in `file` (a new file, or an existing QUARVO database: idempotent).
  // Throws UsageError for a file that is not a QUARVO database.
  static std::unique_ptr<Workspace> init(const std::filesystem::path& file);

  host::SqliteDatabase& db() { return *db_; }
  // Seeds the demo data set once; returns false when it was already there.
  bool seedDemo();
  // Starts the session of `company`/`user` with `ui`.
  host::Session& startSession(host::UiDriver& ui, const std::string& company,
                              const std::string& user);
  host::Session& session() { return *session_; }

 private:
  explicit Workspace(std::unique_ptr<host::SqliteDatabase> db) : db_(std::move(db)) {}
  std::unique_ptr<host::SqliteDatabase> db_;
  std::unique_ptr<host::Session> session_;
};

std::string readFile(const std::filesystem::path& file);

}  // namespace quarvo::app
