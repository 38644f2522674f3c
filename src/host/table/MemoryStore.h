// A memory table of the session ("M_...", "MEM:...", interface records "I_...").
//
// Same contract as a persistent table: selections in key order (the declared key columns, else
// insertion order), fetch, insert, update, delete. Its rows are shared with the cursors that
// read them (see TableStore::partagee) and copied only when changed while shared. Columns are added
// on first write, typed by the value written, unless the table was created with the layout of a
// persistent table. The session owns memory tables and shares them by name between its automata.
#pragma once

#include <map>

#include "host/table/Store.h"

namespace quarvo::host {

ColKind colKindOfValue(Kind k);
// Does `value` satisfy `c`? Shared by memory tables and tests.
bool matches(const Valeur& value, const Criterion& c);

class MemoryStore : public TableStore {
 public:
  explicit MemoryStore(std::string name) : name_(std::move(name)) {}
  MemoryStore(std::string name, const TableSchema& layout)
      : name_(std::move(name)), schema_(layout) {}

  const std::string& name() const override { return name_; }
  TableSchema& schema() override { return schema_; }
  bool extensible() const override { return true; }
  std::vector<RowId> select(const std::vector<Criterion>& criteria) override;
  bool fetch(RowId id, Row& out) override;
  std::shared_ptr<const Row> partagee(RowId id) override;
  RowId insert(const Row& row) override;
  RowId adopt(Row&& row) override;
  void update(RowId id, const Row& row, const std::vector<bool>& changees) override;
  void remove(RowId id) override;
  int64_t removeAll(const std::vector<Criterion>& criteria) override;
  int64_t count(const std::vector<Criterion>& criteria) override;

  // Key columns by name; selections come sorted on them.
  void setKey(const std::vector<std::string>& columns);
  // The first row, created empty when the table has none (interface records are one row).
  Row& firstRow();
  // Makes `row` the table's only row: an interface record taking the row just read.
  void remplacerPar(const Row& row) {
    clear();
    insert(row);
  }
  void clear() {
    rows_.clear();
    index_.clear();
  }
  size_t size() const { return rows_.size(); }

 private:
  bool rowMatches(const Row& row, const std::vector<Criterion>& criteria) const;
  Valeur cell(const Row& row, size_t i) const;

  std::string name_;
  TableSchema schema_;
  // Index of the first key column's text, when the table has a key: selections on that column
  // ('=' or '/') read only the rows they need instead of the whole table.
  void indexAdd(RowId id, const Row& row);
  void indexRemove(RowId id, const Row& row);
  std::string indexText(const Row& row) const;

  // A row to change: copied first when a cursor still reads it.
  Row& modifiable(std::shared_ptr<Row>& row);

  std::map<RowId, std::shared_ptr<Row>> rows_;
  std::multimap<std::string, RowId> index_;
  RowId next_ = 1;
};

}  // namespace quarvo::host
