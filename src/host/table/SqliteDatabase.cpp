#include "host/table/SqliteDatabase.h"

#include <sqlite3.h>

#include <algorithm>
#include <atomic>
#include <cctype>
#include <condition_variable>
#include <map>
#include <mutex>
#include <stop_token>
#include <thread>

#include "host/UException.h"

namespace quarvo::host {

namespace {

std::string sqlIdent(const std::string& identifier) {
  std::string out = "\"";
  for (char c : identifier) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + "\"";
}

// RAII reset of a cached statement. Bindings are left as they are: every use of a statement
// binds all its parameters again.
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

}  // namespace

// A persistent table of the SQLite database.
class SqliteStore : public TableStore {
 public:
  SqliteStore(SqliteDatabase& db, std::string name) : db_(db), name_(std::move(name)) {
    sqlite3_stmt* st = db_.prepare("SELECT name, type, pk FROM pragma_table_info(?)");
    Reset reset{st};
    sqlite3_bind_text(st, 1, name_.c_str(), -1, SQLITE_TRANSIENT);
    std::vector<std::pair<int, size_t>> pk;
    while (sqlite3_step(st) == SQLITE_ROW) {
      std::string col = reinterpret_cast<const char*>(sqlite3_column_text(st, 0));
      const unsigned char* type = sqlite3_column_text(st, 1);
      size_t i =
          schema_.add({col, colKindFromDeclared(type ? reinterpret_cast<const char*>(type) : "")});
      int k = sqlite3_column_int(st, 2);
      if (k > 0) pk.emplace_back(k, i);
    }
    std::sort(pk.begin(), pk.end());
    std::vector<size_t> key;
    for (auto& [k, i] : pk) key.push_back(i);
    schema_.setKey(key);
    std::string cols;
    std::string marks;
    std::string sets;
    for (const auto& c : schema_.columns()) {
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
    for (size_t i : key) order_ += sqlIdent(schema_.columns()[i].name) + ", ";
    order_ += "rowid";
    fetchSql_ = "SELECT " + cols + " FROM " + sqlIdent(name_) + " WHERE rowid = ?";
    insertSql_ = "INSERT INTO " + sqlIdent(name_) + " (" + cols + ") VALUES (" + marks + ")";
    updateSql_ = "UPDATE " + sqlIdent(name_) + " SET " + sets + " WHERE rowid = ?";
    colonnesCritere_.assign(schema_.columns().size(), false);
    colonnesDeclencheur_.assign(schema_.columns().size(), false);
    noterDifferables(key);
    sqlite3_stmt* tr =
        db_.prepare("SELECT sql FROM sqlite_master WHERE type = 'trigger' AND tbl_name = ?");
    Reset resetTr{tr};
    sqlite3_bind_text(tr, 1, name_.c_str(), -1, SQLITE_TRANSIENT);
    while (sqlite3_step(tr) == SQLITE_ROW) {
      const unsigned char* sql = sqlite3_column_text(tr, 0);
      noterDeclencheur(sql ? reinterpret_cast<const char*>(sql) : "");
      aDesDeclencheurs_ = true;
    }
  }

  // The columns whose update may wait in memory (see update): those no write can make fail,
  // being neither in the key nor in an index, in a table without CHECK constraints or
  // generated columns. (NOT NULL cannot fail: a store never binds NULL.)
  void noterDifferables(const std::vector<size_t>& cle) {
    colonnesDifferables_.assign(schema_.columns().size(), true);
    for (size_t i : cle) colonnesDifferables_[i] = false;
    sqlite3_stmt* ix = db_.prepare(
        "SELECT ii.name FROM pragma_index_list(?1) AS il, pragma_index_info(il.name) AS ii");
    Reset resetIx{ix};
    sqlite3_bind_text(ix, 1, name_.c_str(), -1, SQLITE_TRANSIENT);
    while (sqlite3_step(ix) == SQLITE_ROW) {
      const unsigned char* col = sqlite3_column_text(ix, 0);
      if (col == nullptr) {
        colonnesDifferables_.assign(schema_.columns().size(), false);  // an expression index
        continue;
      }
      if (auto i = schema_.index(reinterpret_cast<const char*>(col))) {
        colonnesDifferables_[*i] = false;
      }
    }
    sqlite3_stmt* def =
        db_.prepare("SELECT sql FROM sqlite_master WHERE type = 'table' AND name = ?");
    Reset resetDef{def};
    sqlite3_bind_text(def, 1, name_.c_str(), -1, SQLITE_TRANSIENT);
    std::string sql;
    if (sqlite3_step(def) == SQLITE_ROW && sqlite3_column_text(def, 0) != nullptr) {
      sql = reinterpret_cast<const char*>(sqlite3_column_text(def, 0));
    }
    for (char& c : sql) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    if (sql.empty() || sql.find("CHECK") != std::string::npos ||
        sql.find("GENERATED") != std::string::npos || sql.find(" AS (") != std::string::npos) {
      colonnesDifferables_.assign(schema_.columns().size(), false);
    }
  }

  // Notes which updates fire a trigger of the table: "UPDATE OF a, b" names its columns, a
  // plain UPDATE trigger fires on any. Insert and delete triggers need no columns: inserts and
  // deletes forget the table's selections anyway, and write what waits first (ecrireAvant).
  void noterDeclencheur(std::string sql) {
    for (char& c : sql) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    for (char& c : sql) {
      if (std::isspace(static_cast<unsigned char>(c))) c = ' ';
    }
    std::string entete = sql.substr(0, sql.find(" BEGIN"));  // the event clause
    auto of = entete.find(" UPDATE OF ");
    if (of == std::string::npos) {
      if (entete.find(" UPDATE ") != std::string::npos) declencheTout_ = true;
      return;
    }
    auto on = entete.find(" ON ", of);
    std::string liste =
        entete.substr(of + 11, on == std::string::npos ? std::string::npos : on - of - 11);
    size_t debut = 0;
    while (debut <= liste.size()) {
      size_t virgule = liste.find(',', debut);
      std::string nom =
          liste.substr(debut, virgule == std::string::npos ? std::string::npos : virgule - debut);
      std::string propre;
      for (char c : nom) {
        if (c != '"' && c != ' ' && c != '`' && c != '[' && c != ']') propre += c;
      }
      auto i = schema_.index(propre);
      if (i) {
        colonnesDeclencheur_[*i] = true;
      } else {
        declencheTout_ = true;  // not understood: assume the worst
      }
      if (virgule == std::string::npos) break;
      debut = virgule + 1;
    }
  }

  // Forgets every remembered selection and row; updates still waiting are written first.
  void oublier() {
    ecrireEnAttente();
    selections_.clear();
    lignes_.clear();
  }

  // Writes the updates waiting in memory, one statement per row.
  void ecrireEnAttente() {
    if (enAttente_.empty()) return;
    auto lignes = std::move(enAttente_);
    enAttente_.clear();
    for (const auto& [id, colonnes] : lignes) {
      auto retenue = lignes_.find(id);
      if (retenue == lignes_.end() || !retenue->second) {
        throw UException("update of " + name_ + " lost before it was written");  // cannot be
      }
      std::vector<size_t> ecrites;
      for (size_t i = 0; i < colonnes.size(); ++i) {
        if (colonnes[i]) ecrites.push_back(i);
      }
      executerUpdate(id, *retenue->second, ecrites);
    }
  }

  // Drops the updates waiting in memory: the savepoint they belong to is rolled back.
  void abandonnerEnAttente() { enAttente_.clear(); }

  bool exists() const { return !schema_.columns().empty(); }
  const std::string& name() const override { return name_; }
  TableSchema& schema() override { return schema_; }
  bool extensible() const override { return false; }

  std::vector<RowId> select(const std::vector<Criterion>& criteria) override {
    std::string cle;
    if (db_.memoireActive()) {
      cle = cleSelection(criteria);
      auto it = selections_.find(cle);
      if (it != selections_.end()) return it->second;
    }
    std::vector<RowId> ids = lireSelection(criteria);
    if (!cle.empty() && ids.size() <= kSelectionRetenue) retenir(criteria, cle, ids);
    return ids;
  }

  std::optional<std::vector<RowId>> selectTriee(const std::vector<Criterion>& criteria,
                                                const std::vector<std::string>& tri) override {
    // Texts compare bytewise in SQLite as in Valeur::compare; numbers, ISO dates and times
    // order alike. Decimals are stored as text and lists are not ordered: those are sorted by
    // the caller. A missing value reads as the kind's default, so it orders as one.
    std::string ordre = " ORDER BY ";
    for (const auto& column : tri) {
      auto i = schema_.index(column);
      if (!i) return std::nullopt;
      const ColumnInfo& col = schema_.columns()[*i];
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

  std::vector<RowId> lireSelection(const std::vector<Criterion>& criteria) {
    return lireSelection(criteria, order_);
  }

  std::vector<RowId> lireSelection(const std::vector<Criterion>& criteria,
                                   const std::string& ordre) {
    ecrireEnAttente();  // the file must hold what the cursors see
    std::vector<Valeur> binds;
    std::string sql = "SELECT rowid FROM " + sqlIdent(name_) + where(criteria, binds) + ordre;
    sqlite3_stmt* st = db_.prepare(sql);
    Reset reset{st};
    bindAll(st, binds, 1);
    std::vector<RowId> ids;
    int rc;
    while ((rc = sqlite3_step(st)) == SQLITE_ROW) ids.push_back(sqlite3_column_int64(st, 0));
    if (rc != SQLITE_DONE) db_.fail("select on " + name_);
    return ids;
  }

  bool fetch(RowId id, Row& out) override {
    auto retenue = lignes_.end();
    if (db_.memoireActive()) {
      retenue = lignes_.find(id);
      if (retenue != lignes_.end() && retenue->second) {
        out = *retenue->second;
        return true;
      }
    }
    if (!lireLigne(id, out)) return false;
    if (retenue != lignes_.end()) retenue->second = out;
    return true;
  }

  bool lireLigne(RowId id, Row& out) {
    if (fetchSt_ == nullptr) fetchSt_ = db_.prepare(fetchSql_);
    sqlite3_stmt* st = fetchSt_;
    Reset reset{st};
    sqlite3_bind_int64(st, 1, id);
    int rc = sqlite3_step(st);
    if (rc == SQLITE_DONE) return false;
    if (rc != SQLITE_ROW) db_.fail("read of " + name_);
    const auto& cols = schema_.columns();
    out.values.resize(cols.size());
    for (size_t i = 0; i < cols.size(); ++i)
      readColumn(st, static_cast<int>(i), cols[i].kind, out.values[i]);
    return true;
  }

  RowId insert(const Row& row) override {
    ecrireAvant(aDesDeclencheurs_);
    selections_.clear();  // the new row may match any of them
    if (insertSt_ == nullptr) insertSt_ = db_.prepare(insertSql_);
    sqlite3_stmt* st = insertSt_;
    ResetDelie reset{st};
    bindRow(st, row);
    step(st, "insert into");
    return sqlite3_last_insert_rowid(db_.handle());
  }

  void update(RowId id, const Row& row, const std::vector<bool>& changees) override {
    const auto& cols = schema_.columns();
    auto changee = [&](size_t i) {
      return changees.empty() || (i < changees.size() && changees[i]);
    };
    // Only the changed columns are written: SQLite then maintains only the indexes (and fires
    // only the triggers) of those columns.
    std::vector<size_t> ecrites;
    for (size_t i = 0; i < cols.size(); ++i) {
      if (changee(i)) ecrites.push_back(i);
    }
    if (ecrites.empty()) return;
    bool declenche = declencheTout_;
    for (size_t i : ecrites) declenche = declenche || colonnesDeclencheur_[i];
    auto retenue = lignes_.find(id);
    // A remembered selection stays right when no column it selects on changes, and no trigger
    // fires (it might change any column behind our back).
    if (declenche || retenue == lignes_.end() || !retenue->second ||
        changeUnCritere(*retenue->second, row, ecrites)) {
      selections_.clear();
    }
    // Inside a transaction, the update of a remembered row that fires no trigger and writes
    // only columns no write can make fail waits in memory: a batch updates the same budget
    // line, link and counter for every line of a piece. The remembered row takes the new
    // values at once; the file gets them, one statement per row, at the transaction's next
    // savepoint, release or commit, or before any statement that reads this table or may fire
    // a trigger. A rollback drops them with the savepoint they belong to.
    bool differe = db_.memoireActive() && !declenche && retenue != lignes_.end() &&
                   retenue->second && retenue->second->values.size() == cols.size();
    for (size_t i : ecrites) differe = differe && colonnesDifferables_[i];
    if (differe) {
      std::vector<Valeur> valeurs;
      valeurs.reserve(ecrites.size());
      for (size_t i : ecrites) valeurs.push_back(ajustee(row, i));
      Row& memoire = *retenue->second;
      std::vector<bool>& colonnes = enAttente_[id];
      colonnes.resize(cols.size(), false);
      for (size_t k = 0; k < ecrites.size(); ++k) {
        memoire.values[ecrites[k]] = std::move(valeurs[k]);
        colonnes[ecrites[k]] = true;
      }
      db_.noterEnAttente(this);
      return;
    }
    ecrireAvant(declenche);
    // The remembered row is forgotten until the write is done, then updated in place when no
    // trigger ran; otherwise it is read again on its next fetch.
    retenue = lignes_.find(id);
    std::optional<Row> avant;
    if (retenue != lignes_.end()) avant.swap(retenue->second);
    executerUpdate(id, row, ecrites);
    if (avant && !declenche) {
      for (size_t i : ecrites) avant->values[i] = ajustee(row, i);
      retenue = lignes_.find(id);
      if (retenue != lignes_.end()) retenue->second = std::move(avant);
    }
  }

  // Column i of `row` in the column's kind, as it will be stored.
  Valeur ajustee(const Row& row, size_t i) const {
    const ColumnInfo& col = schema_.columns()[i];
    if (i >= row.values.size()) return defaultOf(col.kind);
    auto valeur = fitColumn(col, row.values[i]);
    if (!valeur) {
      throw UException("value '" + row.values[i].toChaine() + "' does not fit column " + name_ +
                       "." + col.name);
    }
    return std::move(*valeur);
  }

  // UPDATE of the columns `ecrites` of row `id`, from `row`.
  void executerUpdate(RowId id, const Row& row, const std::vector<size_t>& ecrites) {
    const auto& cols = schema_.columns();
    sqlite3_stmt*& st = updates_[ecrites];
    if (st == nullptr) {
      if (ecrites.size() == cols.size()) {
        st = db_.prepare(updateSql_);
      } else {
        std::string sql = "UPDATE " + sqlIdent(name_) + " SET ";
        for (size_t k = 0; k < ecrites.size(); ++k) {
          if (k > 0) sql += ", ";
          sql += sqlIdent(cols[ecrites[k]].name) + " = ?";
        }
        st = db_.prepare(sql + " WHERE rowid = ?");
      }
    }
    ResetDelie reset{st};
    for (size_t k = 0; k < ecrites.size(); ++k)
      bindColumn(st, static_cast<int>(k) + 1, row, ecrites[k]);
    sqlite3_bind_int64(st, static_cast<int>(ecrites.size()) + 1, id);
    step(st, "update of");
  }

  // Before a statement that writes this table: what waits is written first, so that the file
  // sees the writes in order; everything that waits when the statement may fire a trigger,
  // which may read or write any table, otherwise only this table's.
  void ecrireAvant(bool declenche) {
    if (declenche) {
      db_.ecrireEnAttente();
    } else {
      ecrireEnAttente();
    }
  }

  void remove(RowId id) override {
    ecrireAvant(aDesDeclencheurs_);
    selections_.clear();
    lignes_.erase(id);
    sqlite3_stmt* st = db_.prepare("DELETE FROM " + sqlIdent(name_) + " WHERE rowid = ?");
    Reset reset{st};
    sqlite3_bind_int64(st, 1, id);
    step(st, "delete from");
  }

  int64_t removeAll(const std::vector<Criterion>& criteria) override {
    ecrireAvant(aDesDeclencheurs_);
    oublier();
    std::vector<Valeur> binds;
    sqlite3_stmt* st = db_.prepare("DELETE FROM " + sqlIdent(name_) + where(criteria, binds));
    Reset reset{st};
    bindAll(st, binds, 1);
    step(st, "delete from");
    return sqlite3_changes(db_.handle());
  }

  int64_t count(const std::vector<Criterion>& criteria) override {
    ecrireEnAttente();
    std::vector<Valeur> binds;
    sqlite3_stmt* st =
        db_.prepare("SELECT COUNT(*) FROM " + sqlIdent(name_) + where(criteria, binds));
    Reset reset{st};
    bindAll(st, binds, 1);
    if (sqlite3_step(st) != SQLITE_ROW) db_.fail("count of " + name_);
    return sqlite3_column_int64(st, 0);
  }

 private:
  // Selections of at most this many rows are remembered (lookups of reference rows, counters);
  // larger ones are traversals, read once.
  static constexpr size_t kSelectionRetenue = 64;
  // Past this many remembered selections or rows, the table starts afresh.
  static constexpr size_t kRetenuesMax = 4096;

  static std::string cleSelection(const std::vector<Criterion>& criteria) {
    std::string cle;
    for (const auto& c : criteria) {
      cle += c.column;
      cle += '\x1f';
      cle += c.op;
      cle += static_cast<char>('0' + static_cast<int>(c.value.kind()));
      cle += c.value.toChaine();
      cle += '\x1e';
    }
    return cle;
  }

  void retenir(const std::vector<Criterion>& criteria, const std::string& cle,
               const std::vector<RowId>& ids) {
    if (selections_.size() >= kRetenuesMax || lignes_.size() >= kRetenuesMax) oublier();
    for (const auto& c : criteria) {
      if (auto i = schema_.index(c.column)) colonnesCritere_[*i] = true;
    }
    selections_.emplace(cle, ids);
    for (RowId id : ids) lignes_.try_emplace(id);
  }

  bool changeUnCritere(const Row& avant, const Row& apres,
                       const std::vector<size_t>& ecrites) const {
    const auto& cols = schema_.columns();
    for (size_t i : ecrites) {
      if (!colonnesCritere_[i]) continue;
      if (i >= avant.values.size() || i >= apres.values.size()) return true;
      auto fitted = fitColumn(cols[i], apres.values[i]);
      if (!fitted || !(*fitted == avant.values[i])) return true;
    }
    return false;
  }

  // Runs a statement that returns no rows; `what` ("insert into") names it in errors.
  void step(sqlite3_stmt* st, const char* what) {
    int rc = sqlite3_step(st);
    if (rc == SQLITE_DONE) return;
    std::string quoi = std::string(what) + " " + name_;
    if ((rc & 0xff) == SQLITE_CONSTRAINT) {
      throw ConstraintError(quoi + ": " + sqlite3_errmsg(db_.handle()));
    }
    db_.fail(quoi);
  }

  std::string where(const std::vector<Criterion>& criteria, std::vector<Valeur>& binds) {
    std::string sql;
    for (const auto& c : criteria) {
      auto i = schema_.index(c.column);
      if (!i) throw UException("table " + name_ + " has no column " + c.column);
      const ColumnInfo& col = schema_.columns()[*i];
      sql += sql.empty() ? " WHERE " : " AND ";
      std::string q = sqlIdent(col.name);
      if (c.op == '/') {
        // "Starts with" as a range, so that an index on the column serves it: every text that
        // starts with the prefix sorts between the prefix and the prefix followed by the highest
        // character (texts compare bytewise, and valid UTF-8 has no byte above F4).
        std::string prefix = c.value.toChaine();
        sql += q + " >= ? AND " + q + " < ?";
        binds.push_back(Valeur::chaine(prefix));
        binds.push_back(Valeur::chaine(prefix + "\xF4\x8F\xBF\xBF"));
        continue;
      }
      const char* cmp = c.op == '+' ? " >= ?" : c.op == '-' ? " <= ?" : " = ?";
      auto fitted = fitColumn(col, c.value);
      if (col.kind == ColKind::Decimal && c.op != '=') {
        sql += "CAST(" + q + " AS REAL)" + cmp;
        binds.push_back(Valeur::dbl(fitted ? fitted->asMonnaie().toDouble() : 0.0));
      } else if (col.kind == ColKind::Date) {
        sql += "COALESCE(" + q + ", '')" + cmp;
        binds.push_back(Valeur::chaine(fitted ? fitted->asDate().iso() : c.value.toChaine()));
      } else {
        sql += q + cmp;
        binds.push_back(fitted ? storageForm(col.kind, *fitted) : c.value);
      }
    }
    return sql;
  }

  static Valeur storageForm(ColKind k, const Valeur& v) {
    switch (k) {
      case ColKind::Decimal:
        return Valeur::chaine(v.asMonnaie().text());
      case ColKind::Date:
        return Valeur::chaine(v.asDate().iso());
      default:
        return v;
    }
  }

  void bindAll(sqlite3_stmt* st, const std::vector<Valeur>& values, int first) {
    int i = first;
    for (const auto& v : values) bindValue(st, i++, v);
  }

  static void bindValue(sqlite3_stmt* st, int i, const Valeur& v) {
    switch (v.kind()) {
      case Kind::Entier:
        sqlite3_bind_int64(st, i, v.asEntier());
        break;
      case Kind::Double:
        sqlite3_bind_double(st, i, v.asDouble());
        break;
      case Kind::Simple:
        sqlite3_bind_double(st, i, v.asSimple());
        break;
      default: {
        std::string text = v.toChaine();
        sqlite3_bind_text(st, i, text.c_str(), static_cast<int>(text.size()), SQLITE_TRANSIENT);
      }
    }
  }

  void bindRow(sqlite3_stmt* st, const Row& row) {
    for (size_t i = 0; i < schema_.columns().size(); ++i) {
      bindColumn(st, static_cast<int>(i) + 1, row, i);
    }
  }

  // Binds column i of the row to parameter n, in its stored form.
  void bindColumn(sqlite3_stmt* st, int n, const Row& row, size_t i) {
    if (i < row.values.size() && row.values[i].kind() == valueKindOf(schema_.columns()[i].kind)) {
      // Already of the column's kind, as cursors write values.
      bindStored(st, n, row.values[i], SQLITE_STATIC);
      return;
    }
    bindStored(st, n, ajustee(row, i), SQLITE_TRANSIENT);
  }

  // Binds a value of its column's kind as it is stored (see storageForm). With SQLITE_STATIC a
  // text is bound without a copy: `v` is then the row's own value, alive until the statement
  // has run, and the bindings are cleared after (ResetDelie).
  static void bindStored(sqlite3_stmt* st, int n, const Valeur& v, sqlite3_destructor_type texte) {
    switch (v.kind()) {
      case Kind::Chaine: {
        const std::string& text = v.asChaine();
        sqlite3_bind_text(st, n, text.data(), static_cast<int>(text.size()), texte);
        return;
      }
      case Kind::Monnaie:
      case Kind::Date: {
        std::string text = v.kind() == Kind::Monnaie ? v.asMonnaie().text() : v.asDate().iso();
        sqlite3_bind_text(st, n, text.data(), static_cast<int>(text.size()), SQLITE_TRANSIENT);
        return;
      }
      default:
        bindValue(st, n, v);
    }
  }

  // Reads column i of the current result row into `out`, in the column's kind.
  static void readColumn(sqlite3_stmt* st, int i, ColKind k, Valeur& out) {
    int type = sqlite3_column_type(st, i);
    if (type == SQLITE_NULL) {
      out = defaultOf(k);
      return;
    }
    switch (k) {
      case ColKind::Integer:
        out = Valeur::entier(sqlite3_column_int64(st, i));
        return;
      case ColKind::Real:
        out = Valeur::dbl(sqlite3_column_double(st, i));
        return;
      default:
        break;
    }
    std::string_view text(reinterpret_cast<const char*>(sqlite3_column_text(st, i)),
                          static_cast<size_t>(sqlite3_column_bytes(st, i)));
    if (k == ColKind::Decimal) {
      auto m = Monnaie::parse(text);
      out = Valeur::monnaie(m ? *m : Monnaie());
    } else if (k == ColKind::Date) {
      auto d = Date::parse(text);
      out = Valeur::date(d ? *d : Date());
    } else {
      out.assignerChaine(text);
    }
  }

  SqliteDatabase& db_;
  std::string name_;
  TableSchema schema_;
  std::string order_;
  std::string fetchSql_;
  std::string insertSql_;
  std::string updateSql_;
  // Statements of this table, prepared once (the database's cache owns them).
  sqlite3_stmt* fetchSt_ = nullptr;
  sqlite3_stmt* insertSt_ = nullptr;
  std::map<std::vector<size_t>, sqlite3_stmt*> updates_;  // by the columns written
  // What was read inside transactions while no other connection changed the file (see
  // SqliteDatabase::memoireActive): selections by their criteria, and the rows they gave (a row
  // is remembered once fetched; an empty entry is a row to remember on its next fetch).
  std::unordered_map<std::string, std::vector<RowId>> selections_;
  std::unordered_map<RowId, std::optional<Row>> lignes_;
  std::vector<bool> colonnesCritere_;      // columns some remembered selection selects on
  std::vector<bool> colonnesDeclencheur_;  // columns whose update fires a trigger
  bool declencheTout_ = false;             // some trigger fires on any update
  bool aDesDeclencheurs_ = false;          // the table has triggers of any kind
  std::vector<bool> colonnesDifferables_;  // columns whose update may wait (see update)
  // Rows updated in memory only, with the columns still to write (their remembered row holds
  // the values).
  std::unordered_map<RowId, std::vector<bool>> enAttente_;
};

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

// Copies the write-ahead log into the database file on a thread of its own. SQLite's automatic
// checkpoint runs inside the commit that crosses its threshold, on the writer's time; a passive
// checkpoint from another connection needs no lock the writer holds, so the writer goes on
// while the pages are copied and the file synced. When the log has been copied whole, the
// writer's next transaction starts it again from the beginning. Failures are left to the next
// request: the writer checkpoints itself if the log keeps growing (see surCommit).
class CheckpointEnFond {
 public:
  explicit CheckpointEnFond(std::filesystem::path path)
      : path_(std::move(path)), thread_([this](std::stop_token stop) { boucle(stop); }) {}

  // Stops the thread, after the copy in progress if any.
  ~CheckpointEnFond() {
    thread_.request_stop();
    thread_.join();
  }

  void demander() {
    {
      std::lock_guard lock(mutex_);
      demande_ = true;
    }
    cv_.notify_one();
  }

  int64_t faits() const { return faits_.load(); }

 private:
  void boucle(std::stop_token stop) {
    sqlite3* db = nullptr;
    if (sqlite3_open_v2(path_.c_str(), &db, SQLITE_OPEN_READWRITE | SQLITE_OPEN_NOMUTEX, nullptr) !=
        SQLITE_OK) {
      sqlite3_close(db);
      return;  // the writer's own checkpoints take over
    }
    sqlite3_busy_timeout(db, 1000);
    while (true) {
      {
        std::unique_lock lock(mutex_);
        if (!cv_.wait(lock, stop, [this] { return demande_; })) break;
        demande_ = false;
      }
      if (sqlite3_wal_checkpoint_v2(db, nullptr, SQLITE_CHECKPOINT_PASSIVE, nullptr, nullptr) ==
          SQLITE_OK) {
        ++faits_;
      }
    }
    sqlite3_close(db);
  }

  std::filesystem::path path_;
  std::mutex mutex_;
  std::condition_variable_any cv_;
  bool demande_ = false;
  std::atomic<int64_t> faits_{0};
  std::jthread thread_;  // last: it starts once the members above exist
};

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
  if (sqlite3_open_v2(path.c_str(), &db_, flags, nullptr) != SQLITE_OK) {
    std::string msg = db_ ? sqlite3_errmsg(db_) : "out of memory";
    sqlite3_close(db_);
    db_ = nullptr;
    throw UException("cannot open database " + path.string() + ": " + msg);
  }
  sqlite3_busy_timeout(db_, 30000);
  sqlite3_extended_result_codes(db_, 1);
  // Batches read the same reference rows again and again: a page cache of 64 MiB and a mapped
  // file keep those reads in memory instead of going back to the file each time.
  try {
    execScript(
        "PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL; PRAGMA foreign_keys = OFF; "
        "PRAGMA cache_size = -65536; PRAGMA mmap_size = 268435456;");
  } catch (...) {
    // A file that is not a database fails here: the destructor will not run, so close now.
    for (auto& [sql, st] : statements_) sqlite3_finalize(st);
    statements_.clear();
    sqlite3_close(db_);
    db_ = nullptr;
    throw;
  }
  // In place of SQLite's automatic checkpoint (it is this same hook).
  sqlite3_wal_hook(db_, &SqliteDatabase::surCommit, this);
}

SqliteDatabase::~SqliteDatabase() {
  checkpoint_.reset();  // before the close, which copies what is left of the log
  enAttente_.clear();   // an open transaction is rolled back below
  stores_.clear();
  for (auto& [sql, st] : statements_) sqlite3_finalize(st);
  while (depth_ > 0) rollback();
  sqlite3_close(db_);
}

void SqliteDatabase::fail(const std::string& what) {
  throw UException(what + ": " + sqlite3_errmsg(db_));
}

sqlite3_stmt* SqliteDatabase::prepare(const std::string& sql) {
  auto it = statements_.find(sql);
  if (it != statements_.end()) return it->second;
  sqlite3_stmt* st = nullptr;
  if (sqlite3_prepare_v2(db_, sql.c_str(), -1, &st, nullptr) != SQLITE_OK) fail("prepare " + sql);
  statements_.emplace(sql, st);
  return st;
}

TableStore* SqliteDatabase::store(const std::string& table) {
  auto it = stores_.find(table);
  if (it != stores_.end()) return it->second.get();
  auto s = std::make_unique<SqliteStore>(*this, table);
  if (!s->exists()) return nullptr;
  return stores_.emplace(table, std::move(s)).first->second.get();
}

std::vector<std::string> SqliteDatabase::tableNames() {
  std::vector<std::string> names;
  sqlite3_stmt* st = prepare("SELECT name FROM sqlite_master WHERE type = 'table' ORDER BY name");
  Reset reset{st};
  while (sqlite3_step(st) == SQLITE_ROW) {
    names.emplace_back(reinterpret_cast<const char*>(sqlite3_column_text(st, 0)));
  }
  return names;
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

void SqliteDatabase::execScript(const std::string& sql) {
  oublierLectures();  // a script may change anything
  executer(sql);
}

void SqliteDatabase::executer(const std::string& sql) {
  char* err = nullptr;
  if (sqlite3_exec(db_, sql.c_str(), nullptr, nullptr, &err) != SQLITE_OK) {
    std::string msg = err ? err : "unknown error";
    sqlite3_free(err);
    throw UException("database script failed: " + msg);
  }
}

void SqliteDatabase::begin() {
  ecrireEnAttente();  // what waits belongs to the enclosing level
  if (depth_ == 0) {
    executer("BEGIN IMMEDIATE");
    // What was remembered from earlier transactions holds unless another connection has
    // committed since: SQLite's data version changes exactly then.
    sqlite3_stmt* st = prepare("PRAGMA data_version");
    Reset reset{st};
    int64_t version = sqlite3_step(st) == SQLITE_ROW ? sqlite3_column_int64(st, 0) : -1;
    if (version != dataVersion_ || version < 0) oublierLectures();
    dataVersion_ = version;
  } else {
    pas("SAVEPOINT sp" + std::to_string(depth_));
  }
  ++depth_;
}

void SqliteDatabase::commit() {
  if (depth_ == 0) throw UException("commit without a transaction");
  ecrireEnAttente();
  --depth_;
  if (depth_ == 0) {
    executer("COMMIT");
  } else {
    pas("RELEASE sp" + std::to_string(depth_));
  }
}

void SqliteDatabase::rollback() {
  if (depth_ == 0) return;
  // What waits was written after the savepoint being rolled back: it is dropped with it.
  for (auto& [name, store] : stores_) store->abandonnerEnAttente();
  enAttente_.clear();
  oublierLectures();  // rows read or written in the undone work are no longer true
  --depth_;
  if (depth_ == 0) {
    char* err = nullptr;
    sqlite3_exec(db_, "ROLLBACK", nullptr, nullptr, &err);
    sqlite3_free(err);
  } else {
    std::string sp = "sp" + std::to_string(depth_);
    sqlite3_exec(db_, ("ROLLBACK TO " + sp + "; RELEASE " + sp).c_str(), nullptr, nullptr, nullptr);
  }
}

}  // namespace quarvo::host
