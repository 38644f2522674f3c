// A read-only join that the store runs: the rows of several tables tied by their columns, read
// in one statement instead of one lookup per row.
//
// The first table drives; each next table is tied to tables before it by `liens` and filtered
// by the same criteria a cursor takes (see Criterion). An optional table keeps the rows before
// it when nothing of it matches: it is then absent from that row. Rows come ordered on each
// table in turn, in that table's key order (as a cursor's selection gives them), so a walk
// meets a parent's rows once, grouped, before the next parent.
//
// The cursor belongs to its caller (unique_ptr) and borrows its database: it must go before
// the database does and, on a store that reads one moment (see Lecture), before that read ends.
// A row's values belong to the cursor and change on the next `suivant`. Identifiers are checked
// against the schema; values are bound, never written into the query's text.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/table/Store.h"

namespace quarvo::host {

// A tie of a table's column to a column of an earlier table of the join: equal ('='), or
// starting with that column's text followed by `suite` ('/').
struct LienJointure {
  std::string colonne;
  size_t table = 0;  // REQUIRES: below the position of the table it ties
  std::string colonneAutre;
  char op = '=';
  std::string suite;

  static LienJointure egal(std::string colonne, size_t table, std::string colonneAutre) {
    return {std::move(colonne), table, std::move(colonneAutre), '=', {}};
  }
  static LienJointure commencePar(std::string colonne, size_t table, std::string colonneAutre,
                                  std::string suite) {
    return {std::move(colonne), table, std::move(colonneAutre), '/', std::move(suite)};
  }
};

struct TableJointe {
  std::string table;
  std::vector<LienJointure> liens;
  std::vector<Criterion> criteres;
  bool facultative = false;
  // The columns read; the others read as their kind's default. Empty: every column.
  std::vector<std::string> colonnes = {};
};

struct Jointure {
  std::vector<TableJointe> tables;
};

class CurseurJoint {
 public:
  virtual ~CurseurJoint() = default;
  // Moves to the next row; false at the end (then nothing is current).
  virtual bool suivant() = 0;
  // Whether table `t` has a row in the current row (always, for a table that is not optional).
  virtual bool presente(size_t t) const = 0;
  // The row id of table `t`'s part of the current row. REQUIRES: presente(t).
  virtual RowId id(size_t t) const = 0;
  // Table `t`'s part of the current row, every column of its schema in its kind. The cursor
  // keeps it until the next `suivant`, and over the rows where that part stays the same row;
  // a caller that keeps it longer may take it (moved out): it is read again on the next
  // `suivant`. REQUIRES: presente(t).
  virtual Row& ligne(size_t t) = 0;
};

}  // namespace quarvo::host
