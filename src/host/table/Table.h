// A row cursor on a named table, owned by an automaton (or by a test).
//
// The context name tells several cursors on one table apart ("TABLEORIGINE", "QUARVO2"). A cursor
// keeps its criteria, the row ids of its open selection (in the table's key order) and a buffer
// for the current row; `Champ` columns read and write that buffer. Cursors on interface records
// ("I_AFLBUD") are always on the record's single row, shared by the whole session, so that what
// a sibling module's "LECTURE" left there is what the caller reads.
//
// Return codes follow the runtime's convention: 0 when the operation found or wrote a row,
// non-zero otherwise. Database faults throw UException (caught by the handler's guard).
#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "host/table/Store.h"

namespace quarvo::host {

class Automate;
class Session;
class MemoryStore;

class Table {
 public:
  // The two null texts, the kind 'E' and the integer 1 are accepted for the declaration's shape.
  Table(Automate* owner, std::string base, std::string name, std::string context,
        const char* unused1 = nullptr, const char* unused2 = nullptr, char kind = 'E',
        int unused3 = 1);
  // A table made in a handler goes away with it: its automaton forgets it.
  ~Table();
  Table(const Table&) = delete;
  Table& operator=(const Table&) = delete;

  const std::string& base() const { return base_; }
  const std::string& name() const { return name_; }
  const std::string& context() const { return context_; }

  // Criteria: column, comparison ('=', '+' from, '-' up to, '/' starts with), value, value kind
  // ('A' text, 'D' date, 'R' as is).
  void effacerCriteres();
  void ajouterCritere(const std::string& column, char op, const Valeur& value, char kind = 'A');
  void verrouiller(char mode = 'E') { lock_ = mode; }
  // Opens the selection; returns 0 when it holds at least one row.
  int ouvrir();
  // Opens the selection ordered on `tri` (ties in key order; no columns is key order) when the
  // store can order it; false, and nothing opened, when it cannot.
  bool ouvrirTrie(const std::vector<std::string>& tri);
  // mode 1 next row, 3 first row, 4 last row. Opens the selection when it is not open.
  int lire(int mode = 1, char option = 'A');
  // New selection on one criterion, then read with `mode`.
  int chercher(int mode, const std::string& column, char op, const Valeur& value);
  // Empty row buffer (column defaults) ready for `inserer`.
  void preparer();
  int inserer();
  int modifier();
  int supprimer(char option = 'N');
  int64_t supprimerTout();
  int64_t compter();
  // Number of rows in the open selection.
  size_t tailleSelection() const { return selection_.size(); }
  // The row id at position i of the open selection. REQUIRES: i < tailleSelection().
  RowId selectionnee(size_t i) const { return selection_[i]; }

  // The row id of the current row, and positioning on a row id of this table.
  RowId courantId() const { return current_; }
  int aller(RowId id);
  // Makes `row`, row `id` of this table read elsewhere (a join's part of it), the current row,
  // as `aller(id)` would without reading it again.
  void poserLigne(RowId id, Row&& row);

  bool courante() const { return current_ != 0 || isRecord_; }
  // The value of a column of the current row; it stays valid until the cursor moves or is
  // written to.
  const Valeur& valeur(std::string_view column);
  // Writes into the current row buffer, converted to the column's kind; false when it does not
  // convert or the column does not exist.
  bool ecrire(std::string_view column, const Valeur& value);
  // The same, taking the value when it is already of the column's kind.
  bool ecrire(std::string_view column, Valeur&& value);
  const Row& ligne();

  TableStore& store();
  // The folder that holds the database file.
  static std::filesystem::path repSGBD();

 private:
  Session& session();
  void load(RowId id);
  // Makes the row read in place the cursor's own buffer, before a write.
  void detacher();

  Automate* owner_;
  std::string base_;
  std::string name_;
  std::string context_;
  bool isRecord_;
  TableStore* store_ = nullptr;
  std::vector<Criterion> criteria_;
  std::vector<RowId> selection_;
  bool open_ = false;
  size_t position_ = 0;  // next index of the selection for mode 1
  RowId current_ = 0;
  Row buffer_;
  // The current row as the store holds it, read in place (then `buffer_` is not used).
  std::shared_ptr<const Row> partagee_;
  std::vector<bool> changees_;  // columns whose value changed since the row was read or prepared
  char lock_ = 0;
};

}  // namespace quarvo::host
