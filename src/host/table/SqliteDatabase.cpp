#include "host/table/SqliteDatabase.h"

#include <sqlite3.h>

#include <algorithm>
#include <cctype>
#include <string_view>

#include "host/UException.h"
#include "host/table/CheckpointEnFond.h"
#include "host/table/SqliteJointure.h"
#include "host/table/SqliteSchema.h"
#include "host/table/SqliteStatements.h"
#include "host/table/SqliteStore.h"

namespace quarvo::host {

namespace {
// A piece written inside a group of pieces is a savepoint: the pages it changes are first copied
// to the statement journal, which SQLite spills to a temporary file after 64 KiB. Keeping it in
// memory saves a file write per page; it is emptied whenever no savepoint is open, so it holds
// at most one piece's pages. No memory statistics are kept: they cost a global lock per
// allocation. Settings of this kind must be made before SQLite initialises.
[[maybe_unused]] const bool reglagesSqlite = [] {
  sqlite3_config(SQLITE_CONFIG_STMTJRNL_SPILL, -1);
  sqlite3_config(SQLITE_CONFIG_MEMSTATUS, 0);
  return true;
}();
}  // namespace

void SqliteDatabase::Fermeture::operator()(sqlite3* db) const {
  sqlite3_close(db);
}

int SqliteDatabase::surCommit(void* self, sqlite3* db, const char* base, int pages) {
  auto& database = *static_cast<SqliteDatabase*>(self);
  if (pages >= 4 * database.pagesCheckpoint_) {
    // The thread is not keeping up (or cannot open the file): bound the log here.
    sqlite3_wal_checkpoint_v2(db, base, SQLITE_CHECKPOINT_PASSIVE, nullptr, nullptr);
  } else if (pages >= database.pagesCheckpoint_) {
    if (!database.checkpoint_)
      database.checkpoint_ = std::make_unique<CheckpointEnFond>(database.path_);
    database.checkpoint_->demander();
  }
  return SQLITE_OK;
}

int64_t SqliteDatabase::checkpointsEnFond() const {
  return checkpoint_ ? checkpoint_->faits() : 0;
}

SqliteDatabase::SqliteDatabase(const std::filesystem::path& path, bool create, int pagesCheckpoint)
    : path_(path), pagesCheckpoint_(pagesCheckpoint) {
  // A connection serves one session, on one thread: no locking of its own is needed.
  int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX | (create ? SQLITE_OPEN_CREATE : 0);
  sqlite3* db = nullptr;
  int rc = sqlite3_open_v2(path.c_str(), &db, flags, nullptr);
  db_.reset(db);  // closed by the members' destructors if this constructor throws
  if (rc != SQLITE_OK) {
    throw UException("cannot open database " + path.string() + ": " +
                     (db ? sqlite3_errmsg(db) : "out of memory"));
  }
  statements_ = std::make_unique<SqliteStatements>(db);
  schema_ = std::make_unique<SqliteSchema>(*statements_);
  sqlite3_busy_timeout(db, 30000);
  sqlite3_extended_result_codes(db, 1);
  // Batches read the same reference rows again and again: a page cache of 64 MiB and a mapped
  // file keep those reads in memory instead of going back to the file each time. A file that
  // is not a database fails here.
  execScript(
      "PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL; PRAGMA foreign_keys = OFF; "
      "PRAGMA cache_size = -65536; PRAGMA mmap_size = 268435456;");
  // In place of SQLite's automatic checkpoint (it is this same hook).
  sqlite3_wal_hook(db, &SqliteDatabase::surCommit, this);
}

SqliteDatabase::~SqliteDatabase() {
  checkpoint_.reset();  // before the close, which copies what is left of the log
  enAttente_.clear();   // an open transaction is rolled back below
  stores_.clear();
  statements_->finaliser();
  while (depth_ > 0) rollback();
}

void SqliteDatabase::fail(const std::string& what) {
  statements_->fail(what);
}

sqlite3_stmt* SqliteDatabase::prepare(const std::string& sql) {
  return statements_->prepare(sql);
}

std::vector<std::vector<std::string>> SqliteDatabase::interroger(
    const std::string& sql, const std::vector<Valeur>& parametres) {
  ecrireEnAttente();  // the file must hold what the query reads
  sqlite3_stmt* brut = nullptr;
  const char* reste = nullptr;
  if (sqlite3_prepare_v2(db_.get(), sql.c_str(), static_cast<int>(sql.size()), &brut, &reste) !=
      SQLITE_OK) {
    fail("query " + sql);
  }
  std::unique_ptr<sqlite3_stmt, Finaliser> st(brut);
  // BEGIN, COMMIT, SAVEPOINT and ATTACH count as read-only for SQLite but return no rows.
  bool seule = reste == nullptr ||
               std::string_view(reste).find_first_not_of(" \t\r\n;") == std::string_view::npos;
  if (!st || !seule || sqlite3_stmt_readonly(st.get()) == 0 ||
      sqlite3_column_count(st.get()) == 0) {
    throw UException("not a read-only query: " + sql);
  }
  bindAll(st.get(), parametres, 1);
  std::vector<std::vector<std::string>> lignes;
  const int colonnes = sqlite3_column_count(st.get());
  int rc;
  while ((rc = sqlite3_step(st.get())) == SQLITE_ROW) {
    auto& ligne = lignes.emplace_back();
    for (int i = 0; i < colonnes; ++i) {
      const unsigned char* texte = sqlite3_column_text(st.get(), i);
      ligne.emplace_back(texte ? reinterpret_cast<const char*>(texte) : "");
    }
  }
  if (rc != SQLITE_DONE) fail("query " + sql);
  return lignes;
}

TableStore* SqliteDatabase::store(const std::string& table) {
  auto it = stores_.find(table);
  if (it != stores_.end()) return it->second.get();
  auto s = std::make_unique<SqliteStore>(*this, *statements_, table, schema_->decrire(table));
  if (!s->exists()) return nullptr;
  return stores_.emplace(table, std::move(s)).first->second.get();
}

std::vector<std::string> SqliteDatabase::tableNames() {
  return schema_->tables();
}

void SqliteDatabase::pas(const std::string& sql) {
  // Savepoints come and go with every unit of a batch: their statements are prepared once.
  sqlite3_stmt* st = prepare(sql);
  Reset reset{st};
  if (sqlite3_step(st) != SQLITE_DONE) fail(sql);
}

void SqliteDatabase::noterEnAttente(SqliteStore* store) {
  if (std::find(enAttente_.begin(), enAttente_.end(), store) == enAttente_.end()) {
    enAttente_.push_back(store);
  }
}

void SqliteDatabase::ecrireEnAttente() {
  while (!enAttente_.empty()) {
    enAttente_.back()->ecrireEnAttente();
    enAttente_.pop_back();
  }
}

void SqliteDatabase::oublierLectures() {
  for (auto& [name, store] : stores_) store->oublier();
}

void SqliteDatabase::abandonnerMemoire() {
  // What waits was written after the savepoint being rolled back: it is dropped with it.
  for (auto& [name, store] : stores_) store->abandonnerEnAttente();
  enAttente_.clear();
  oublierLectures();  // rows read or written in the undone work are no longer true
}

void SqliteDatabase::oublierCibles(const CiblesDeclencheurs& cibles) {
  if (cibles.toutes) {
    oublierLectures();
    return;
  }
  if (cibles.tables.empty()) return;
  for (auto& [name, store] : stores_) {
    std::string nom = name;
    for (char& c : nom) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    if (std::find(cibles.tables.begin(), cibles.tables.end(), nom) != cibles.tables.end()) {
      store->oublier();
    }
  }
}

void SqliteDatabase::verifierSchema() {
  SqliteSchema::Version version = schema_->version();
  if (version == versionSchema_) return;
  versionSchema_ = version;
  for (auto& [name, store] : stores_) store->reapprendre(schema_->decrire(name));
}

void SqliteDatabase::execScript(const std::string& sql) {
  oublierLectures();  // a script may change anything, the schema included
  try {
    executer(sql);
  } catch (const UException&) {
    verifierSchema();  // what ran before the failing statement stays
    throw;
  }
  verifierSchema();
}

void SqliteDatabase::delaiAttente(std::chrono::milliseconds delai) {
  sqlite3_busy_timeout(db_.get(), static_cast<int>(delai.count()));
}

void SqliteDatabase::executer(const std::string& sql) {
  char* err = nullptr;
  int rc = sqlite3_exec(db_.get(), sql.c_str(), nullptr, nullptr, &err);
  if (rc != SQLITE_OK) {
    sqlite3_free(err);
    echecSqlite(db_.get(), sqlite3_extended_errcode(db_.get()), "database script");
  }
}

void SqliteDatabase::verifierVersion() {
  // What was remembered from earlier transactions holds unless another connection has
  // committed since: SQLite's data version changes exactly then.
  sqlite3_stmt* st = prepare("PRAGMA data_version");
  Reset reset{st};
  int64_t version = sqlite3_step(st) == SQLITE_ROW ? sqlite3_column_int64(st, 0) : -1;
  if (version != dataVersion_ || version < 0) {
    oublierLectures();
    verifierSchema();
  }
  dataVersion_ = version;
}

Database::Marque SqliteDatabase::marque() {
  // SQLite's data version changes when another connection commits; this connection's own
  // writes are counted by the rows it changed (committed or not: a mark that changes for
  // nothing only costs a selection made again).
  sqlite3_stmt* st = prepare("PRAGMA data_version");
  Reset reset{st};
  int64_t version = sqlite3_step(st) == SQLITE_ROW ? sqlite3_column_int64(st, 0) : -1;
  return {version, sqlite3_total_changes64(db_.get())};
}

void SqliteDatabase::commencerLecture() {
  if (depth_ > 0) {
    lectures_.push_back(false);
    return;
  }
  executer("BEGIN DEFERRED");
  try {
    // The first read takes the snapshot; in WAL mode it holds no lock a writer waits on.
    sqlite3_stmt* st = prepare("SELECT 1 FROM sqlite_schema LIMIT 1");
    Reset reset{st};
    int rc = sqlite3_step(st);
    if (rc != SQLITE_ROW && rc != SQLITE_DONE) fail("read of one moment");
    verifierVersion();
  } catch (...) {
    sqlite3_exec(db_.get(), "ROLLBACK", nullptr, nullptr, nullptr);
    throw;
  }
  depth_ = 1;
  lectures_.push_back(true);
}

void SqliteDatabase::finirLecture() {
  if (lectures_.empty()) throw UException("end of a read that was not begun");
  bool ouverte = lectures_.back();
  lectures_.pop_back();
  if (ouverte) commit();
}

std::unique_ptr<CurseurJoint> SqliteDatabase::joindre(const Jointure& jointure) {
  RequeteJointe requete =
      construireJointure(jointure, [this](const std::string& table) -> SqliteStore* {
        return static_cast<SqliteStore*>(store(table));
      });
  ecrireEnAttente();  // the file must hold what the join reads
  sqlite3_stmt* st = prepare(requete.sql);
  std::unique_ptr<sqlite3_stmt, Finaliser> propre;
  if (jointuresEnCours_.count(st) > 0) {
    // The same join is being read by another cursor: this one reads its own statement.
    sqlite3_stmt* brut = nullptr;
    if (sqlite3_prepare_v2(db_.get(), requete.sql.c_str(), -1, &brut, nullptr) != SQLITE_OK) {
      fail("prepare " + requete.sql);
    }
    propre.reset(brut);
    st = brut;
  }
  return std::make_unique<SqliteCurseurJoint>(*statements_, std::move(requete), st,
                                              std::move(propre), jointuresEnCours_);
}

void SqliteDatabase::begin() {
  if (!lectures_.empty() && lectures_.front()) {
    // Its writes would wait for the read to end, and fail if another connection wrote since.
    throw UException("a transaction inside a read of one moment");
  }
  ecrireEnAttente();  // what waits belongs to the enclosing level
  if (depth_ == 0) {
    executer("BEGIN IMMEDIATE");
    verifierVersion();
  } else {
    pas("SAVEPOINT sp" + std::to_string(depth_));
  }
  ++depth_;
}

void SqliteDatabase::commit() {
  if (depth_ == 0) throw UException("commit without a transaction");
  ecrireEnAttente();
  // The level is closed only once SQLite has closed it: a COMMIT refused (a deferred
  // constraint, a lock another connection holds) leaves the transaction open, for the caller
  // to roll back or to try again.
  if (depth_ > 1) {
    pas("RELEASE sp" + std::to_string(depth_ - 1));
    --depth_;
    return;
  }
  try {
    executer("COMMIT");
  } catch (const UException&) {
    if (sqlite3_get_autocommit(db_.get()) != 0) {
      // SQLite gave the transaction up itself (an I/O error, a full disk): so does the store.
      abandonnerMemoire();
      depth_ = 0;
    }
    throw;
  }
  depth_ = 0;
}

void SqliteDatabase::rollback() {
  if (depth_ == 0) return;
  abandonnerMemoire();
  --depth_;
  if (depth_ == 0) {
    char* err = nullptr;
    sqlite3_exec(db_.get(), "ROLLBACK", nullptr, nullptr, &err);
    sqlite3_free(err);
  } else {
    std::string sp = "sp" + std::to_string(depth_);
    sqlite3_exec(db_.get(), ("ROLLBACK TO " + sp + "; RELEASE " + sp).c_str(), nullptr, nullptr,
                 nullptr);
  }
}

}  // namespace quarvo::host
