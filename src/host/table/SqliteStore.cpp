#include "host/table/SqliteStore.h"

#include "host/UException.h"
#include "host/table/SqliteDatabase.h"

namespace quarvo::host {

namespace {
// What a column of kind `k` holds, for the error that names a stored value it cannot read.
const char* formeAttendue(ColKind k) {
  switch (k) {
    case ColKind::Decimal:
      return "an amount";
    case ColKind::Date:
      return "a date";
    case ColKind::DecimalList:
      return "a list of amounts";
    case ColKind::DateList:
      return "a list of dates";
    default:
      return "of its column's kind";
  }
}
}  // namespace

SqliteStore::SqliteStore(SqliteDatabase& db, SqliteStatements& statements, std::string name,
                         DescriptionTable description)
    : db_(db),
      statements_(statements),
      name_(std::move(name)),
      description_(std::move(description)) {
  const TableSchema& schema = description_.schema;
  std::string cols;
  std::string marks;
  std::string sets;
  for (const auto& c : schema.columns()) {
    if (!cols.empty()) {
      cols += ", ";
      marks += ", ";
      sets += ", ";
    }
    cols += sqlIdent(c.name);
    marks += "?";
    sets += sqlIdent(c.name) + " = ?";
  }
  order_ = " ORDER BY ";
  for (size_t i : schema.key()) order_ += sqlIdent(schema.columns()[i].name) + ", ";
  order_ += "rowid";
  fetchSql_ = "SELECT " + cols + " FROM " + sqlIdent(name_) + " WHERE rowid = ?";
  insertSql_ = "INSERT INTO " + sqlIdent(name_) + " (" + cols + ") VALUES (" + marks + ")";
  updateSql_ = "UPDATE " + sqlIdent(name_) + " SET " + sets + " WHERE rowid = ?";
}

void SqliteStore::reapprendre(DescriptionTable description) {
  const auto& avant = description_.schema.columns();
  const auto& apres = description.schema.columns();
  bool memes = avant.size() == apres.size();
  for (size_t i = 0; memes && i < avant.size(); ++i) {
    memes = avant[i].name == apres[i].name && avant[i].kind == apres[i].kind;
  }
  if (!memes) {
    description_.differables.assign(avant.size(), false);
    description_.declencheTout = true;
    description_.aDesDeclencheurs = true;
    description_.cibles = CiblesDeclencheurs{true, {}};
    return;
  }
  description.schema = std::move(description_.schema);
  description_ = std::move(description);
}

void SqliteStore::oublier() {
  ecrireEnAttente();
  memoire_.vider();
}

void SqliteStore::ecrireEnAttente() {
  if (!memoire_.tientDesMises()) return;
  MemoireTable::EnAttente lignes = memoire_.prendreEnAttente();
  for (const auto& [id, colonnes] : lignes) {
    std::shared_ptr<Row>* retenue = memoire_.ligne(id);
    if (retenue == nullptr || !*retenue) {
      throw UException("update of " + name_ + " lost before it was written");  // cannot be
    }
    std::vector<size_t> ecrites;
    for (size_t i = 0; i < colonnes.size(); ++i) {
      if (colonnes[i]) ecrites.push_back(i);
    }
    executerUpdate(id, **retenue, ecrites);
  }
}

std::vector<RowId> SqliteStore::select(const std::vector<Criterion>& criteria) {
  // A selection without criteria (a whole small table: the purchase accounts, the settings) is
  // remembered like any other; its key is the empty one.
  std::optional<std::string> cle;
  if (db_.memoireActive()) {
    cle = MemoireTable::cleSelection(criteria);
    if (const auto* ids = memoire_.selection(*cle)) return *ids;
  }
  std::vector<RowId> ids = lireSelection(criteria, order_);
  if (cle && ids.size() <= MemoireTable::kSelectionRetenue) {
    if (memoire_.pleine()) oublier();
    memoire_.retenir(description_.schema, criteria, *cle, ids);
  }
  return ids;
}

std::optional<std::vector<RowId>> SqliteStore::selectTriee(const std::vector<Criterion>& criteria,
                                                           const std::vector<std::string>& tri) {
  // Texts compare bytewise in SQLite as in Valeur::compare; numbers, ISO dates and times order
  // alike. Decimals are stored as text and lists are not ordered: those are sorted by the
  // caller. A missing value reads as the kind's default, so it orders as one.
  const TableSchema& schema = description_.schema;
  std::string ordre = " ORDER BY ";
  for (const auto& column : tri) {
    auto i = schema.index(column);
    if (!i) return std::nullopt;
    const ColumnInfo& col = schema.columns()[*i];
    std::string q = sqlIdent(col.name);
    switch (col.kind) {
      case ColKind::Text:
      case ColKind::Date:
      case ColKind::Time:
        ordre += "COALESCE(" + q + ", ''), ";
        break;
      case ColKind::Integer:
      case ColKind::Real:
        ordre += "COALESCE(" + q + ", 0), ";
        break;
      default:
        return std::nullopt;
    }
  }
  return lireSelection(criteria, ordre + order_.substr(std::string(" ORDER BY ").size()));
}

std::vector<RowId> SqliteStore::lireSelection(const std::vector<Criterion>& criteria,
                                              const std::string& ordre) {
  ecrireEnAttente();  // the file must hold what the cursors see
  std::vector<Valeur> binds;
  std::string sql = "SELECT rowid FROM " + sqlIdent(name_) + where(criteria, binds) + ordre;
  sqlite3_stmt* st = statements_.prepare(sql);
  Reset reset{st};
  bindAll(st, binds, 1);
  std::vector<RowId> ids;
  int rc;
  while ((rc = sqlite3_step(st)) == SQLITE_ROW) ids.push_back(sqlite3_column_int64(st, 0));
  if (rc != SQLITE_DONE) statements_.fail("select on " + name_);
  return ids;
}

bool SqliteStore::fetch(RowId id, Row& out) {
  if (auto partagee = this->partagee(id)) {
    out = *partagee;
    return true;
  }
  return lireLigne(id, out);
}

std::shared_ptr<const Row> SqliteStore::partagee(RowId id) {
  if (!db_.memoireActive()) return nullptr;
  std::shared_ptr<Row>* retenue = memoire_.ligne(id);
  if (retenue == nullptr) return nullptr;
  if (!*retenue) {
    auto lue = std::make_shared<Row>();
    if (!lireLigne(id, *lue)) return nullptr;
    *retenue = std::move(lue);
  }
  return *retenue;
}

bool SqliteStore::lireLigne(RowId id, Row& out) {
  if (fetchSt_ == nullptr) fetchSt_ = statements_.prepare(fetchSql_);
  sqlite3_stmt* st = fetchSt_;
  Reset reset{st};
  sqlite3_bind_int64(st, 1, id);
  int rc = sqlite3_step(st);
  if (rc == SQLITE_DONE) return false;
  if (rc != SQLITE_ROW) statements_.fail("read of " + name_);
  const auto& cols = description_.schema.columns();
  out.values.resize(cols.size());
  out.nulles.assign(cols.size(), false);
  for (size_t i = 0; i < cols.size(); ++i) {
    out.nulles[i] = sqlite3_column_type(st, static_cast<int>(i)) == SQLITE_NULL;
    if (!readColumn(st, static_cast<int>(i), cols[i].kind, out.values[i])) {
      // Written behind the runtime's back: reading it as "no value" would give a wrong
      // figure without a word.
      const unsigned char* texte = sqlite3_column_text(st, static_cast<int>(i));
      throw UException(name_ + "." + cols[i].name + ": stored value '" +
                       (texte ? reinterpret_cast<const char*>(texte) : "") + "' is not " +
                       formeAttendue(cols[i].kind));
    }
  }
  return true;
}

RowId SqliteStore::insert(const Row& row) {
  ecrireAvant(description_.aDesDeclencheurs);
  memoire_.oublierSelections();  // the new row may match any of them
  if (insertSt_ == nullptr) insertSt_ = statements_.prepare(insertSql_);
  sqlite3_stmt* st = insertSt_;
  ResetDelie reset{st};
  bindRow(st, row);
  step(st, "insert into");
  return sqlite3_last_insert_rowid(statements_.handle());
}

void SqliteStore::update(RowId id, const Row& row, const std::vector<bool>& changees) {
  const auto& cols = description_.schema.columns();
  auto changee = [&](size_t i) { return changees.empty() || (i < changees.size() && changees[i]); };
  // Only the changed columns are written: SQLite then maintains only the indexes (and fires
  // only the triggers) of those columns.
  std::vector<size_t> ecrites;
  for (size_t i = 0; i < cols.size(); ++i) {
    if (changee(i)) ecrites.push_back(i);
  }
  if (ecrites.empty()) return;
  bool declenche = description_.declencheTout;
  for (size_t i : ecrites) declenche = declenche || description_.declencheurs[i];
  std::shared_ptr<Row>* retenue = memoire_.ligne(id);
  // A remembered selection stays right when no column it selects on changes, and no trigger
  // fires (it might change any column behind our back).
  if (declenche || retenue == nullptr || !*retenue ||
      memoire_.changeUnCritere(description_.schema, **retenue, row, ecrites)) {
    memoire_.oublierSelections();
  }
  // Inside a transaction, the update of a remembered row that fires no trigger and writes
  // only columns no write can make fail waits in memory: a batch updates the same budget
  // line, link and counter for every line of a piece. The remembered row takes the new
  // values at once; the file gets them, one statement per row, at the transaction's next
  // savepoint, release or commit, or before any statement that reads this table or may fire
  // a trigger. A rollback drops them with the savepoint they belong to.
  bool differe = db_.memoireActive() && !declenche && retenue != nullptr && *retenue &&
                 (*retenue)->values.size() == cols.size();
  for (size_t i : ecrites) differe = differe && description_.differables[i];
  if (differe) {
    std::vector<Valeur> valeurs;
    valeurs.reserve(ecrites.size());
    for (size_t i : ecrites) valeurs.push_back(ajustee(row, i));
    memoire_.tenir(id, *retenue, ecrites, std::move(valeurs));
    db_.noterEnAttente(this);
    return;
  }
  ecrireAvant(declenche);
  // The remembered row is forgotten until the write is done, then updated in place when no
  // trigger ran; otherwise it is read again on its next fetch.
  retenue = memoire_.ligne(id);
  std::shared_ptr<Row> avant;
  if (retenue != nullptr) avant.swap(*retenue);
  executerUpdate(id, row, ecrites);
  if (avant && !declenche) {
    Row& memoire = MemoireTable::aChanger(avant);
    for (size_t i : ecrites) {
      memoire.values[i] = ajustee(row, i);
      memoire.remplie(i);
    }
    retenue = memoire_.ligne(id);
    if (retenue != nullptr) *retenue = std::move(avant);
  }
}

Valeur SqliteStore::ajustee(const Row& row, size_t i) const {
  const ColumnInfo& col = description_.schema.columns()[i];
  if (i >= row.values.size()) return defaultOf(col.kind);
  auto valeur = fitColumn(col, row.values[i]);
  if (!valeur) {
    throw UException("value '" + row.values[i].toChaine() + "' does not fit column " + name_ + "." +
                     col.name);
  }
  return std::move(*valeur);
}

// UPDATE of the columns `ecrites` of row `id`, from `row`.
void SqliteStore::executerUpdate(RowId id, const Row& row, const std::vector<size_t>& ecrites) {
  const auto& cols = description_.schema.columns();
  sqlite3_stmt*& st = updates_[ecrites];
  if (st == nullptr) {
    if (ecrites.size() == cols.size()) {
      st = statements_.prepare(updateSql_);
    } else {
      std::string sql = "UPDATE " + sqlIdent(name_) + " SET ";
      for (size_t k = 0; k < ecrites.size(); ++k) {
        if (k > 0) sql += ", ";
        sql += sqlIdent(cols[ecrites[k]].name) + " = ?";
      }
      st = statements_.prepare(sql + " WHERE rowid = ?");
    }
  }
  ResetDelie reset{st};
  for (size_t k = 0; k < ecrites.size(); ++k) {
    bindColumn(st, static_cast<int>(k) + 1, row, ecrites[k]);
  }
  sqlite3_bind_int64(st, static_cast<int>(ecrites.size()) + 1, id);
  step(st, "update of");
}

// Before a statement that writes this table: what waits is written first, so that the file
// sees the writes in order; everything that waits when the statement may fire a trigger, which
// may read any table, otherwise only this table's. The tables the triggers may write are
// forgotten: what they remember will not be true after the statement.
void SqliteStore::ecrireAvant(bool declenche) {
  if (declenche) {
    db_.ecrireEnAttente();
    db_.oublierCibles(description_.cibles);
  } else {
    ecrireEnAttente();
  }
}

void SqliteStore::remove(RowId id) {
  ecrireAvant(description_.aDesDeclencheurs);
  memoire_.oublierSelections();
  memoire_.oublierLigne(id);
  sqlite3_stmt* st = statements_.prepare("DELETE FROM " + sqlIdent(name_) + " WHERE rowid = ?");
  Reset reset{st};
  sqlite3_bind_int64(st, 1, id);
  step(st, "delete from");
}

int64_t SqliteStore::removeAll(const std::vector<Criterion>& criteria) {
  ecrireAvant(description_.aDesDeclencheurs);
  oublier();
  std::vector<Valeur> binds;
  sqlite3_stmt* st = statements_.prepare("DELETE FROM " + sqlIdent(name_) + where(criteria, binds));
  Reset reset{st};
  bindAll(st, binds, 1);
  step(st, "delete from");
  return sqlite3_changes(statements_.handle());
}

int64_t SqliteStore::count(const std::vector<Criterion>& criteria) {
  ecrireEnAttente();
  std::vector<Valeur> binds;
  sqlite3_stmt* st =
      statements_.prepare("SELECT COUNT(*) FROM " + sqlIdent(name_) + where(criteria, binds));
  Reset reset{st};
  bindAll(st, binds, 1);
  if (sqlite3_step(st) != SQLITE_ROW) statements_.fail("count of " + name_);
  return sqlite3_column_int64(st, 0);
}

// Runs a statement that returns no rows; `what` ("insert into") names it in errors.
void SqliteStore::step(sqlite3_stmt* st, const char* what) {
  int rc = sqlite3_step(st);
  if (rc == SQLITE_DONE) return;
  std::string quoi = std::string(what) + " " + name_;
  if ((rc & 0xff) == SQLITE_CONSTRAINT) {
    throw ConstraintError(quoi + ": " + sqlite3_errmsg(statements_.handle()));
  }
  statements_.fail(quoi);
}

std::string apresLePrefixe(const std::string& prefix) {
  return prefix + "\xF4\x8F\xBF\xBF";
}

std::string sqlCritere(const ColumnInfo& col, const std::string& prefixe, const Criterion& c,
                       std::vector<Valeur>& binds) {
  std::string q = prefixe + sqlIdent(col.name);
  if (c.op == '/') {
    std::string prefix = c.value.toChaine();
    binds.push_back(Valeur::chaine(prefix));
    binds.push_back(Valeur::chaine(apresLePrefixe(prefix)));
    return q + " >= ? AND " + q + " < ?";
  }
  const char* cmp = c.op == '+' ? " >= ?" : c.op == '-' ? " <= ?" : " = ?";
  auto fitted = fitColumn(col, c.value);
  if (col.kind == ColKind::Decimal && c.op != '=') {
    binds.push_back(Valeur::dbl(fitted ? fitted->asMonnaie().toDouble() : 0.0));
    return "CAST(" + q + " AS REAL)" + cmp;
  }
  if (col.kind == ColKind::Date) {
    binds.push_back(Valeur::chaine(fitted ? fitted->asDate().iso() : c.value.toChaine()));
    return "COALESCE(" + q + ", '')" + cmp;
  }
  binds.push_back(fitted ? storageForm(col.kind, *fitted) : c.value);
  return q + cmp;
}

std::string SqliteStore::where(const std::vector<Criterion>& criteria, std::vector<Valeur>& binds) {
  const TableSchema& schema = description_.schema;
  std::string sql;
  for (const auto& c : criteria) {
    auto i = schema.index(c.column);
    if (!i) throw UException("table " + name_ + " has no column " + c.column);
    sql += sql.empty() ? " WHERE " : " AND ";
    sql += sqlCritere(schema.columns()[*i], "", c, binds);
  }
  return sql;
}

void SqliteStore::bindRow(sqlite3_stmt* st, const Row& row) {
  for (size_t i = 0; i < description_.schema.columns().size(); ++i) {
    bindColumn(st, static_cast<int>(i) + 1, row, i);
  }
}

// Binds column i of the row to parameter n, in its stored form.
void SqliteStore::bindColumn(sqlite3_stmt* st, int n, const Row& row, size_t i) {
  if (i < row.values.size() &&
      row.values[i].kind() == valueKindOf(description_.schema.columns()[i].kind)) {
    // Already of the column's kind, as cursors write values.
    bindStored(st, n, row.values[i], SQLITE_STATIC);
    return;
  }
  bindStored(st, n, ajustee(row, i), SQLITE_TRANSIENT);
}

}  // namespace quarvo::host
