// The SQLite store's joins (see Jointure.h): the query a Jointure stands for, and the cursor
// that reads its rows.
//
// Internal to the SQLite store (src/host/table). SqliteDatabase::joindre builds the query from
// the stores' schemas (identifiers checked there, criteria written as the stores write theirs,
// every value bound) and hands the cursor a statement: the cached one when no other cursor is
// reading it, else one of its own. The cursor resets (or finalizes) that statement when it goes
// and reads each table's part of a row in the columns' kinds. It borrows its database's
// statements and must go before them.
#pragma once

#include <functional>
#include <memory>
#include <set>
#include <string>
#include <vector>

#include "host/table/Jointure.h"
#include "host/table/SqliteStatements.h"

namespace quarvo::host {

class SqliteStore;

struct RequeteJointe {
  struct Partie {
    std::string table;
    std::vector<ColKind> colonnes;  // of the schema, every one
    std::vector<size_t> lues;       // the positions of the columns the query reads, in order
    bool facultative = false;
  };
  std::string sql;
  std::vector<Valeur> valeurs;  // bound in order
  std::vector<Partie> parties;
};

// The query of `jointure`; `store` gives a table's store, or null when there is no such table.
// Throws UException for an unknown table or column, or a tie to a later table.
RequeteJointe construireJointure(const Jointure& jointure,
                                 const std::function<SqliteStore*(const std::string&)>& store);

class SqliteCurseurJoint : public CurseurJoint {
 public:
  // Runs `requete` on `st`; `propre` owns it when it is not the cache's. `enCours` holds the
  // cached statements cursors are reading: this one's is taken out when it goes.
  SqliteCurseurJoint(SqliteStatements& statements, RequeteJointe requete, sqlite3_stmt* st,
                     std::unique_ptr<sqlite3_stmt, Finaliser> propre,
                     std::set<sqlite3_stmt*>& enCours);
  ~SqliteCurseurJoint() override;
  SqliteCurseurJoint(const SqliteCurseurJoint&) = delete;
  SqliteCurseurJoint& operator=(const SqliteCurseurJoint&) = delete;

  bool suivant() override;
  bool presente(size_t t) const override { return t < presentes_.size() && presentes_[t]; }
  RowId id(size_t t) const override { return ids_[t]; }
  Row& ligne(size_t t) override { return lignes_[t]; }

 private:
  SqliteStatements& statements_;
  RequeteJointe requete_;
  sqlite3_stmt* st_;
  std::unique_ptr<sqlite3_stmt, Finaliser> propre_;
  std::set<sqlite3_stmt*>& enCours_;
  bool fini_ = false;
  std::vector<bool> presentes_;
  std::vector<RowId> ids_;
  std::vector<Row> lignes_;
};

}  // namespace quarvo::host
