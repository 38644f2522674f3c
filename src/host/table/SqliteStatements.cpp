#include "host/table/SqliteStatements.h"

#include "host/UException.h"

namespace quarvo::host {

sqlite3_stmt* SqliteStatements::prepare(const std::string& sql) {
  auto it = statements_.find(sql);
  if (it != statements_.end()) return it->second;
  sqlite3_stmt* st = nullptr;
  if (sqlite3_prepare_v2(db_, sql.c_str(), -1, &st, nullptr) != SQLITE_OK) fail("prepare " + sql);
  statements_.emplace(sql, st);
  return st;
}

void SqliteStatements::finaliser() {
  for (auto& [sql, st] : statements_) sqlite3_finalize(st);
  statements_.clear();
}

void echecSqlite(sqlite3* db, int rc, const std::string& what) {
  std::string detail = what + ": " + (db != nullptr ? sqlite3_errmsg(db) : sqlite3_errstr(rc));
  switch (rc & 0xff) {
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
    case SQLITE_READONLY:
    case SQLITE_FULL:
    case SQLITE_IOERR:
    case SQLITE_CANTOPEN:
    case SQLITE_PERM:
    case SQLITE_CORRUPT:
    case SQLITE_NOTADB:
    case SQLITE_PROTOCOL:
      throw BaseIndisponible("the database cannot be written (" + detail + ")");
    default:
      throw UException(detail);
  }
}

void SqliteStatements::fail(const std::string& what) const {
  echecSqlite(db_, sqlite3_extended_errcode(db_), what);
}

std::string sqlIdent(const std::string& identifier) {
  std::string out = "\"";
  for (char c : identifier) {
    if (c == '"') out += '"';
    out += c;
  }
  return out + "\"";
}

Valeur storageForm(ColKind k, const Valeur& v) {
  switch (k) {
    case ColKind::Decimal:
      return Valeur::chaine(v.asMonnaie().text());
    case ColKind::Date:
      return Valeur::chaine(v.asDate().iso());
    default:
      return v;
  }
}

void bindValue(sqlite3_stmt* st, int i, const Valeur& v) {
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

void bindAll(sqlite3_stmt* st, const std::vector<Valeur>& values, int first) {
  int i = first;
  for (const auto& v : values) bindValue(st, i++, v);
}

void bindStored(sqlite3_stmt* st, int n, const Valeur& v, sqlite3_destructor_type texte) {
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

namespace {

bool blanc(std::string_view text) {
  return text.find_first_not_of(" \t") == std::string_view::npos;
}

bool montantLisible(std::string_view text) {
  return blanc(text) || Monnaie::parse(text).has_value();
}

bool dateLisible(std::string_view text) {
  return Date::parse(text).has_value();  // blank text is the empty date
}

// Whether every item of a list joined by ';' reads; a blank item is a value not given.
bool listeLisible(std::string_view text, bool (*lisible)(std::string_view)) {
  while (true) {
    size_t fin = text.find(';');
    if (!lisible(text.substr(0, fin))) return false;
    if (fin == std::string_view::npos) return true;
    text.remove_prefix(fin + 1);
  }
}

}  // namespace

bool readColumn(sqlite3_stmt* st, int i, ColKind k, Valeur& out) {
  int type = sqlite3_column_type(st, i);
  if (type == SQLITE_NULL) {
    out = defaultOf(k);
    return true;
  }
  switch (k) {
    case ColKind::Integer:
      out = Valeur::entier(sqlite3_column_int64(st, i));
      return true;
    case ColKind::Real:
      out = Valeur::dbl(sqlite3_column_double(st, i));
      return true;
    default:
      break;
  }
  std::string_view text(reinterpret_cast<const char*>(sqlite3_column_text(st, i)),
                        static_cast<size_t>(sqlite3_column_bytes(st, i)));
  switch (k) {
    case ColKind::Decimal: {
      if (blanc(text)) {
        out = Valeur::monnaie(Monnaie());
        return true;
      }
      auto m = Monnaie::parse(text);
      if (!m) return false;
      out = Valeur::monnaie(*m);
      return true;
    }
    case ColKind::Date: {
      auto d = Date::parse(text);
      if (!d) return false;
      out = Valeur::date(*d);
      return true;
    }
    case ColKind::DecimalList:
      if (!listeLisible(text, montantLisible)) return false;
      break;
    case ColKind::DateList:
      if (!listeLisible(text, dateLisible)) return false;
      break;
    default:
      break;
  }
  out.assignerChaine(text);
  return true;
}

}  // namespace quarvo::host
