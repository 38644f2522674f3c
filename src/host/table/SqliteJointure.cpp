#include "host/table/SqliteJointure.h"

#include "host/UException.h"
#include "host/table/SqliteStore.h"

namespace quarvo::host {

namespace {

const ColumnInfo& colonne(SqliteStore& store, const std::string& name) {
  auto i = store.schema().index(name);
  if (!i) throw UException("table " + store.name() + " has no column " + name);
  return store.schema().columns()[*i];
}

}  // namespace

RequeteJointe construireJointure(const Jointure& jointure,
                                 const std::function<SqliteStore*(const std::string&)>& store) {
  RequeteJointe r;
  if (jointure.tables.empty()) throw UException("a join without tables");
  std::vector<SqliteStore*> stores;
  std::string select;
  std::string from;
  std::string where;
  std::vector<Valeur> valeursWhere;
  std::string ordre;
  for (size_t t = 0; t < jointure.tables.size(); ++t) {
    const TableJointe& tj = jointure.tables[t];
    SqliteStore* s = store(tj.table);
    if (s == nullptr) throw UException("unknown table " + tj.table);
    stores.push_back(s);
    std::string alias = "t" + std::to_string(t);
    auto q = [&](const std::string& a, const ColumnInfo& c) { return a + "." + sqlIdent(c.name); };

    RequeteJointe::Partie partie{s->name(), {}, {}, tj.facultative && t > 0};
    select += (t == 0 ? "" : ", ") + alias + ".rowid";
    for (const auto& c : s->schema().columns()) partie.colonnes.push_back(c.kind);
    if (tj.colonnes.empty()) {
      for (size_t i = 0; i < partie.colonnes.size(); ++i) partie.lues.push_back(i);
    } else {
      for (const auto& name : tj.colonnes) {
        colonne(*s, name);  // known, or the fault names it
        partie.lues.push_back(*s->schema().index(name));
      }
    }
    for (size_t i : partie.lues) select += ", " + q(alias, s->schema().columns()[i]);
    r.parties.push_back(std::move(partie));
    for (size_t k : s->schema().key()) ordre += q(alias, s->schema().columns()[k]) + ", ";
    ordre += alias + ".rowid, ";

    // The ties and criteria of a joined table are its ON clause, so that an optional table
    // that does not match keeps the row; the first table's criteria are the WHERE clause.
    std::string conditions;
    std::vector<Valeur>& valeurs = t == 0 ? valeursWhere : r.valeurs;
    for (const auto& lien : tj.liens) {
      if (lien.table >= t) throw UException("a join ties " + tj.table + " to a later table");
      std::string mien = q(alias, colonne(*s, lien.colonne));
      std::string autre =
          q("t" + std::to_string(lien.table), colonne(*stores[lien.table], lien.colonneAutre));
      conditions += conditions.empty() ? "" : " AND ";
      if (lien.op == '/') {
        // As a cursor's "starts with": a range an index can serve.
        conditions += mien + " >= " + autre + " || ? AND " + mien + " < " + autre + " || ?";
        valeurs.push_back(Valeur::chaine(lien.suite));
        valeurs.push_back(Valeur::chaine(apresLePrefixe(lien.suite)));
      } else {
        conditions += mien + " = " + autre;
      }
    }
    for (const auto& c : tj.criteres) {
      conditions += conditions.empty() ? "" : " AND ";
      conditions += sqlCritere(colonne(*s, c.column), alias + ".", c, valeurs);
    }
    if (t == 0) {
      from = " FROM " + sqlIdent(s->name()) + " " + alias;
      if (!conditions.empty()) where = " WHERE " + conditions;
    } else {
      from += (tj.facultative ? " LEFT JOIN " : " JOIN ") + sqlIdent(s->name()) + " " + alias +
              " ON " + (conditions.empty() ? "1" : conditions);
    }
  }
  ordre.resize(ordre.size() - 2);
  r.sql = "SELECT " + select + from + where + " ORDER BY " + ordre;
  r.valeurs.insert(r.valeurs.end(), valeursWhere.begin(), valeursWhere.end());
  return r;
}

SqliteCurseurJoint::SqliteCurseurJoint(SqliteStatements& statements, RequeteJointe requete,
                                       sqlite3_stmt* st,
                                       std::unique_ptr<sqlite3_stmt, Finaliser> propre,
                                       std::set<sqlite3_stmt*>& enCours)
    : statements_(statements),
      requete_(std::move(requete)),
      st_(st),
      propre_(std::move(propre)),
      enCours_(enCours),
      presentes_(requete_.parties.size(), false),
      ids_(requete_.parties.size(), 0),
      lignes_(requete_.parties.size()) {
  if (!propre_) enCours_.insert(st_);
  bindAll(st_, requete_.valeurs, 1);
}

SqliteCurseurJoint::~SqliteCurseurJoint() {
  sqlite3_reset(st_);
  if (!propre_) enCours_.erase(st_);
}

bool SqliteCurseurJoint::suivant() {
  if (fini_) return false;
  int rc = sqlite3_step(st_);
  if (rc != SQLITE_ROW) {
    fini_ = true;
    presentes_.assign(presentes_.size(), false);
    if (rc != SQLITE_DONE) statements_.fail("join on " + requete_.parties.front().table);
    return false;
  }
  int i = 0;
  for (size_t t = 0; t < requete_.parties.size(); ++t) {
    const auto& partie = requete_.parties[t];
    bool presente = sqlite3_column_type(st_, i) != SQLITE_NULL;
    RowId id = presente ? sqlite3_column_int64(st_, i) : 0;
    Row& ligne = lignes_[t];
    const bool entiere = ligne.values.size() == partie.colonnes.size();
    // A parent's part repeats over its children's rows: it is read once, unless the caller
    // took it.
    const bool dejaLue = presente && presentes_[t] && ids_[t] == id && entiere;
    presentes_[t] = presente;
    ids_[t] = id;
    ++i;
    if (!presente || dejaLue) {
      i += static_cast<int>(partie.lues.size());
      continue;
    }
    if (!entiere) {
      ligne.values.clear();
      for (ColKind k : partie.colonnes) ligne.values.push_back(defaultOf(k));
    }
    for (size_t c : partie.lues) {
      if (!readColumn(st_, i, partie.colonnes[c], ligne.values[c])) {
        const unsigned char* texte = sqlite3_column_text(st_, i);
        throw UException(partie.table + ": stored value '" +
                         (texte ? reinterpret_cast<const char*>(texte) : "") +
                         "' does not read in its column's kind");
      }
      ++i;
    }
  }
  return true;
}

}  // namespace quarvo::host
