#include "support/TestSession.h"

#include <fstream>
#include <random>
#include <sstream>

#include "host/table/Table.h"

namespace quarvo::test {

using namespace host;

std::filesystem::path sourceDir() {
  return QUARVO_SOURCE_DIR;
}

static std::string slurp(const std::filesystem::path& p) {
  std::ifstream in(p);
  std::ostringstream s;
  s << in.rdbuf();
  return s.str();
}

TestSession::TestSession(bool demo, const std::string& company) {
  std::random_device rd;
  dir_ = std::filesystem::temp_directory_path() / ("quarvo-test-" + std::to_string(rd()));
  std::filesystem::create_directories(dir_);
  db_ = std::make_unique<SqliteDatabase>(dir_ / "test.db", true);
  db_->execScript(slurp(sourceDir() / "db" / "schema.sql"));
  if (demo) db_->execScript(slurp(sourceDir() / "db" / "demo.sql"));
  session_ = std::make_unique<Session>(*db_, ui_, company, "demo");
  session_->setDataDir(sourceDir() / "db");
  scope_ = std::make_unique<Session::Scope>(*session_);
}

TestSession::~TestSession() {
  scope_.reset();
  session_.reset();
  db_.reset();
  std::error_code ec;
  std::filesystem::remove_all(dir_, ec);
}

std::string TestSession::value(const std::string& table, const std::string& column,
                               const std::string& identColumn, const std::string& ident) {
  Table t(nullptr, "VOVOVA", table, "TEST");
  if (t.chercher(3, identColumn, '=', Valeur::chaine(ident)) != 0) return "<none>";
  return t.valeur(column).toChaine();
}

}  // namespace quarvo::test
