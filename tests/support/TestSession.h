// A fresh database and session for one test: a temporary SQLite file with the schema (and the
// demo data when asked), a scripted driver whose transcript the test reads, and the session
// made current for the test's lifetime.
#pragma once

#include <filesystem>
#include <memory>
#include <string>

#include "host/session/Session.h"
#include "host/table/SqliteDatabase.h"
#include "host/ui/ScriptedDriver.h"

namespace quarvo::test {

class TestSession {
 public:
  explicit TestSession(bool demo = false, const std::string& company = "DEMO");
  ~TestSession();

  host::SqliteDatabase& db() { return *db_; }
  host::Session& session() { return *session_; }
  host::ScriptedDriver& ui() { return ui_; }
  const std::filesystem::path& dir() const { return dir_; }
  // Runs SQL directly (test set-up only).
  void sql(const std::string& script) { db_->execScript(script); }
  // One value of the first row matching `where` (SQL text), as the runtime reads it.
  std::string value(const std::string& table, const std::string& column,
                    const std::string& identColumn, const std::string& ident);

 private:
  std::filesystem::path dir_;
  std::unique_ptr<host::SqliteDatabase> db_;
  host::ScriptedDriver ui_;
  std::unique_ptr<host::Session> session_;
  std::unique_ptr<host::Session::Scope> scope_;
};

std::filesystem::path sourceDir();

}  // namespace quarvo::test
