// What one table of the SQLite database remembers inside a transaction, and the updates it
// holds back.
//
// Internal to the SQLite store (src/host/table). A batch looks up the same reference rows for
// every line and updates the same budget line, link and counter for every line of a piece:
// inside a transaction, where no other connection can change the file, small selections (by
// their criteria) and the rows they gave are remembered, and some updates of remembered rows
// wait in the row itself until the store writes them. MemoireTable only keeps that memory: the
// SqliteStore that owns it decides what may be remembered or held and when it is forgotten or
// written, and runs the SQL. A remembered row is shared with the cursors that read it: the
// memory never changes a row a cursor still holds, it changes a copy of it (a cursor keeps the
// row as it read it, as when it had copied it).
#pragma once

#include <memory>
#include <optional>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/table/Store.h"

namespace quarvo::host {

class MemoireTable {
 public:
  // Selections of at most this many rows are remembered (lookups of reference rows, counters);
  // larger ones are traversals, read once.
  static constexpr size_t kSelectionRetenue = 64;
  // Past this many remembered selections or rows, the table starts afresh.
  static constexpr size_t kRetenuesMax = 4096;

  // Updates held back: by row, the columns still to write (the remembered row has the values).
  using EnAttente = std::unordered_map<RowId, std::vector<bool>>;

  // The key under which a selection on `criteria` is remembered.
  static std::string cleSelection(const std::vector<Criterion>& criteria);
  // The remembered selection of that key, or null.
  const std::vector<RowId>* selection(const std::string& cle) const;
  // Whether the memory is full: the owner forgets everything before remembering more.
  bool pleine() const;
  // Remembers a selection; its rows are remembered on their next fetch.
  void retenir(const TableSchema& schema, const std::vector<Criterion>& criteria,
               const std::string& cle, const std::vector<RowId>& ids);

  // The entry of a row to remember (empty until fetched), or null when it is not one.
  std::shared_ptr<Row>* ligne(RowId id);
  // The row of `entree` (an entry of this memory) made the memory's own, to be changed: copied
  // first when a cursor shares it.
  static Row& aChanger(std::shared_ptr<Row>& entree);
  // Whether writing `ecrites` from `apres` over the remembered `avant` changes a column some
  // remembered selection selects on.
  bool changeUnCritere(const TableSchema& schema, const Row& avant, const Row& apres,
                       const std::vector<size_t>& ecrites) const;

  void oublierSelections() { selections_.clear(); }
  void oublierLigne(RowId id) { lignes_.erase(id); }
  // Forgets every selection and row. REQUIRES: no update held (the owner writes them first).
  void vider();

  // Holds an update of the remembered row `memoire` (an entry of this memory): its columns
  // `ecrites` take `valeurs` now, and are noted to be written later.
  void tenir(RowId id, std::shared_ptr<Row>& memoire, const std::vector<size_t>& ecrites,
             std::vector<Valeur> valeurs);
  // The updates held, handed over to be written; the memory holds none after.
  EnAttente prendreEnAttente();
  // Drops the updates held: the savepoint they belong to is rolled back.
  void abandonnerEnAttente() { enAttente_.clear(); }
  bool tientDesMises() const { return !enAttente_.empty(); }

 private:
  std::unordered_map<std::string, std::vector<RowId>> selections_;
  // A row is remembered once fetched; an empty entry is a row to remember on its next fetch.
  std::unordered_map<RowId, std::shared_ptr<Row>> lignes_;
  std::vector<bool> colonnesCritere_;  // columns some remembered selection selects on
  EnAttente enAttente_;
};

}  // namespace quarvo::host
