#include "host/table/SqliteSchema.h"

#include <algorithm>
#include <cctype>
#include <unordered_set>

#include "host/table/SqliteStatements.h"

namespace quarvo::host {

DescriptionTable SqliteSchema::decrire(const std::string& table) {
  DescriptionTable d;
  sqlite3_stmt* st = statements_.prepare("SELECT name, type, pk FROM pragma_table_info(?)");
  Reset reset{st};
  sqlite3_bind_text(st, 1, table.c_str(), -1, SQLITE_TRANSIENT);
  std::vector<std::pair<int, size_t>> pk;
  while (sqlite3_step(st) == SQLITE_ROW) {
    std::string col = reinterpret_cast<const char*>(sqlite3_column_text(st, 0));
    const unsigned char* type = sqlite3_column_text(st, 1);
    size_t i =
        d.schema.add({col, colKindFromDeclared(type ? reinterpret_cast<const char*>(type) : "")});
    int k = sqlite3_column_int(st, 2);
    if (k > 0) pk.emplace_back(k, i);
  }
  std::sort(pk.begin(), pk.end());
  std::vector<size_t> key;
  for (auto& [k, i] : pk) key.push_back(i);
  d.schema.setKey(key);
  d.declencheurs.assign(d.schema.columns().size(), false);
  noterDifferables(table, d);
  sqlite3_stmt* tr =
      statements_.prepare("SELECT sql FROM sqlite_master WHERE type = 'trigger' AND tbl_name = ?");
  Reset resetTr{tr};
  sqlite3_bind_text(tr, 1, table.c_str(), -1, SQLITE_TRANSIENT);
  while (sqlite3_step(tr) == SQLITE_ROW) {
    const unsigned char* sql = sqlite3_column_text(tr, 0);
    noterDeclencheur(sql ? reinterpret_cast<const char*>(sql) : "", d);
    d.aDesDeclencheurs = true;
  }
  lireDeclencheurs();
  d.cibles = cibles(table);
  return d;
}

namespace {
std::string majuscules(std::string s) {
  for (char& c : s) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  return s;
}
}  // namespace

SqliteSchema::Version SqliteSchema::version() {
  auto lire = [&](const char* sql) {
    sqlite3_stmt* st = statements_.prepare(sql);
    Reset reset{st};
    if (sqlite3_step(st) != SQLITE_ROW) statements_.fail(sql);
    return sqlite3_column_int64(st, 0);
  };
  return {lire("PRAGMA main.schema_version"), lire("PRAGMA temp.schema_version")};
}

void SqliteSchema::lireDeclencheurs() {
  Version v = version();
  if (v == lus_) return;
  lus_ = v;
  declencheurs_.clear();
  sqlite3_stmt* st = statements_.prepare(
      "SELECT tbl_name, sql FROM sqlite_master WHERE type = 'trigger' "
      "UNION ALL SELECT tbl_name, sql FROM sqlite_temp_master WHERE type = 'trigger'");
  Reset reset{st};
  while (sqlite3_step(st) == SQLITE_ROW) {
    const unsigned char* table = sqlite3_column_text(st, 0);
    const unsigned char* sql = sqlite3_column_text(st, 1);
    std::string nom = table ? reinterpret_cast<const char*>(table) : "";
    declencheurs_.emplace(majuscules(nom),
                          lireDeclencheur(sql ? reinterpret_cast<const char*>(sql) : "", nom));
  }
}

// The tables written by the triggers a statement on `table` may fire, and by the triggers
// those writes fire in turn. A trigger that writes only the row that fired it adds nothing:
// the store reads that row again itself.
CiblesDeclencheurs SqliteSchema::cibles(const std::string& table) const {
  CiblesDeclencheurs c;
  std::vector<std::string> aVoir{majuscules(table)};
  std::unordered_set<std::string> vues{aVoir.front()};
  while (!aVoir.empty()) {
    std::string courante = std::move(aVoir.back());
    aVoir.pop_back();
    auto [debut, fin] = declencheurs_.equal_range(courante);
    for (auto it = debut; it != fin; ++it) {
      const Declencheur& d = it->second;
      if (!d.compris) {
        c.toutes = true;
        c.tables.clear();
        return c;
      }
      for (const auto& e : d.ecritures) {
        if (!e.ligneDeclencheuse &&
            std::find(c.tables.begin(), c.tables.end(), e.table) == c.tables.end()) {
          c.tables.push_back(e.table);
        }
        if (vues.insert(e.table).second) aVoir.push_back(e.table);
      }
    }
  }
  return c;
}

std::vector<std::string> SqliteSchema::tables() {
  std::vector<std::string> names;
  sqlite3_stmt* st =
      statements_.prepare("SELECT name FROM sqlite_master WHERE type = 'table' ORDER BY name");
  Reset reset{st};
  while (sqlite3_step(st) == SQLITE_ROW) {
    names.emplace_back(reinterpret_cast<const char*>(sqlite3_column_text(st, 0)));
  }
  return names;
}

// The columns whose update may wait in memory (see SqliteStore::update): those no write can
// make fail, being neither in the key nor in an index, in a table without CHECK constraints or
// generated columns. (NOT NULL cannot fail: a store never binds NULL.)
void SqliteSchema::noterDifferables(const std::string& table, DescriptionTable& d) {
  const size_t n = d.schema.columns().size();
  d.differables.assign(n, true);
  for (size_t i : d.schema.key()) d.differables[i] = false;
  sqlite3_stmt* ix = statements_.prepare(
      "SELECT ii.name FROM pragma_index_list(?1) AS il, pragma_index_info(il.name) AS ii");
  Reset resetIx{ix};
  sqlite3_bind_text(ix, 1, table.c_str(), -1, SQLITE_TRANSIENT);
  while (sqlite3_step(ix) == SQLITE_ROW) {
    const unsigned char* col = sqlite3_column_text(ix, 0);
    if (col == nullptr) {
      d.differables.assign(n, false);  // an expression index
      continue;
    }
    if (auto i = d.schema.index(reinterpret_cast<const char*>(col))) d.differables[*i] = false;
  }
  sqlite3_stmt* def =
      statements_.prepare("SELECT sql FROM sqlite_master WHERE type = 'table' AND name = ?");
  Reset resetDef{def};
  sqlite3_bind_text(def, 1, table.c_str(), -1, SQLITE_TRANSIENT);
  std::string sql;
  if (sqlite3_step(def) == SQLITE_ROW && sqlite3_column_text(def, 0) != nullptr) {
    sql = reinterpret_cast<const char*>(sqlite3_column_text(def, 0));
  }
  for (char& c : sql) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  if (sql.empty() || sql.find("CHECK") != std::string::npos ||
      sql.find("GENERATED") != std::string::npos || sql.find(" AS (") != std::string::npos) {
    d.differables.assign(n, false);
  }
}

// Notes which updates fire a trigger of the table: "UPDATE OF a, b" names its columns, a
// plain UPDATE trigger fires on any. Insert and delete triggers need no columns: inserts and
// deletes forget the table's selections anyway, and write what waits first.
void SqliteSchema::noterDeclencheur(std::string sql, DescriptionTable& d) {
  for (char& c : sql) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  for (char& c : sql) {
    if (std::isspace(static_cast<unsigned char>(c))) c = ' ';
  }
  std::string entete = sql.substr(0, sql.find(" BEGIN"));  // the event clause
  auto of = entete.find(" UPDATE OF ");
  if (of == std::string::npos) {
    if (entete.find(" UPDATE ") != std::string::npos) d.declencheTout = true;
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
    auto i = d.schema.index(propre);
    if (i) {
      d.declencheurs[*i] = true;
    } else {
      d.declencheTout = true;  // not understood: assume the worst
    }
    if (virgule == std::string::npos) break;
    debut = virgule + 1;
  }
}

}  // namespace quarvo::host
