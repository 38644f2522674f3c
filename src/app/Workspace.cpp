#include "app/Workspace.h"

#include <cstdlib>
#include <fstream>
#include <sstream>

#include "host/UException.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

std::filesystem::path dataDir() {
  if (const char* env = std::getenv("QUARVO_DATA_DIR"); env && *env) return env;
#ifdef QUARVO_DATA_DIR
  return QUARVO_DATA_DIR;
#else
  return "db";
#endif
}

std::string readFile(const std::filesystem::path& file) {
  std::ifstream in(file, std::ios::binary);
  if (!in) throw UsageError("cannot read " + file.string());
  std::ostringstream out;
  out << in.rdbuf();
  return out.str();
}

namespace {

// "yes" for a QUARVO database, "empty" for a file with no table, "no" otherwise.
std::string kindOf(SqliteDatabase& db) {
  auto names = db.tableNames();
  if (names.empty()) return "empty";
  TableStore* meta = db.store("QUARVO_META");
  if (meta == nullptr) return "no";
  auto ids = meta->select({{"CLE", '=', Valeur::chaine("application")}});
  Row row;
  if (ids.empty() || !meta->fetch(ids.front(), row)) return "no";
  auto i = meta->schema().index("VALEUR");
  return i && row.values[*i].toChaine() == "QUARVO" ? "yes" : "no";
}

std::unique_ptr<SqliteDatabase> connect(const std::filesystem::path& file, bool create) {
  try {
    auto db = std::make_unique<SqliteDatabase>(file, create);
    db->tableNames();  // fails here when the file is not a database at all
    return db;
  } catch (const UException& e) {
    throw UsageError(file.string() + " is not a usable database (" + e.what() + ")");
  }
}

}  // namespace

std::unique_ptr<Workspace> Workspace::open(const std::filesystem::path& file) {
  if (!std::filesystem::exists(file)) {
    throw UsageError("database " + file.string() +
                     " does not exist (create it with 'quarvo init')");
  }
  auto db = connect(file, false);
  if (kindOf(*db) != "yes") throw UsageError(file.string() + " is not a QUARVO database");
  return std::unique_ptr<Workspace>(new Workspace(std::move(db)));
}

std::unique_ptr<Workspace> Workspace::init(const std::filesystem::path& file) {
  bool existed = std::filesystem::exists(file);
  if (existed && std::filesystem::file_size(file) > 0) {
    auto db = connect(file, false);
    if (kindOf(*db) == "no") {
      throw UsageError(file.string() + " is not a QUARVO database; it was left untouched");
    }
  }
  auto db = connect(file, true);
  std::string schema = readFile(dataDir() / "schema.sql");
  try {
    Transaction tx(*db);
    db->execScript(schema);
    tx.commit();
  } catch (const UException& e) {
    throw UsageError(std::string("cannot create the schema: ") + e.what());
  }
  return std::unique_ptr<Workspace>(new Workspace(std::move(db)));
}

bool Workspace::seedDemo() {
  TableStore* meta = db_->store("QUARVO_META");
  if (!meta->select({{"CLE", '=', Valeur::chaine("demo")}}).empty()) return false;
  std::string demo = readFile(dataDir() / "demo.sql");
  Transaction tx(*db_);
  db_->execScript(demo);
  Row row;
  row.values = {Valeur::chaine("demo"), Valeur::chaine("1")};
  meta->insert(row);
  tx.commit();
  return true;
}

Session& Workspace::startSession(UiDriver& ui, const std::string& company,
                                 const std::string& user) {
  session_ = std::make_unique<Session>(*db_, ui, company, user);
  session_->setDataDir(dataDir());
  return *session_;
}

}  // namespace quarvo::app
