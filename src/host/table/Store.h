// The storage contract behind every cursor: a named table of rows with typed columns.
//
// A store answers selections (rows matching criteria, in the table's key order), fetches rows by
// their row id, and inserts, updates and deletes rows. Persistent tables live in a SQL database
// (see Database); memory tables ("M_...", "MEM:...", interface records "I_...") live in the
// session. Stores are owned by their database or session; cursors only borrow them.
#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "host/value/Valeur.h"

namespace quarvo::host {

// How a column stores its values. The kind decides conversions and the stored text form.
enum class ColKind { Text, Integer, Real, Decimal, Date, Time, DecimalList, DateList };

Kind valueKindOf(ColKind k);
// Parses a declared SQL column type ("DECIMAL_TEXT", "INTEGER", ...) into its kind.
ColKind colKindFromDeclared(const std::string& declared);

struct ColumnInfo {
  std::string name;
  ColKind kind = ColKind::Text;
};

// The columns of one table, with a by-name index. Memory tables may grow it.
class TableSchema {
 public:
  const std::vector<ColumnInfo>& columns() const { return columns_; }
  // Every read and write of a column by name goes through here: an open-addressing table of
  // column positions, looked up without building a string.
  std::optional<size_t> index(std::string_view column) const;
  size_t add(ColumnInfo info);
  const std::vector<size_t>& key() const { return key_; }
  void setKey(std::vector<size_t> key) { key_ = std::move(key); }

 private:
  void placer(size_t position);

  std::vector<ColumnInfo> columns_;
  std::vector<uint32_t> slots_;  // column position + 1; 0 is an empty slot; size a power of 2
  std::vector<size_t> key_;
};

// One row: values aligned with the schema's columns (missing trailing values read as defaults).
// `nulles` flags the columns the store holds no value for (read as their kind's default): a
// write of that default is still a change of what is stored.
struct Row {
  std::vector<Valeur> values;
  std::vector<bool> nulles;

  bool nulle(size_t i) const { return i < nulles.size() && nulles[i]; }
  // Column i now holds a value of its own.
  void remplie(size_t i) {
    if (i < nulles.size()) nulles[i] = false;
  }
};

// A selection criterion: '=' equal, '+' from (>=), '-' up to (<=), '/' starts with.
struct Criterion {
  std::string column;
  char op = '=';
  Valeur value;
};

using RowId = int64_t;

class TableStore {
 public:
  virtual ~TableStore() = default;
  virtual const std::string& name() const = 0;
  virtual TableSchema& schema() = 0;
  // Memory tables accept unknown columns on write; persistent tables refuse them.
  virtual bool extensible() const = 0;
  // Row ids of the matching rows in the table's key order.
  virtual std::vector<RowId> select(const std::vector<Criterion>& criteria) = 0;
  // The matching rows ordered on `tri` (then the key), when the store can order on those
  // columns exactly as Valeur::compare would; nullopt when the caller must sort them itself.
  virtual std::optional<std::vector<RowId>> selectTriee(const std::vector<Criterion>& criteria,
                                                        const std::vector<std::string>& tri) {
    (void)criteria;
    (void)tri;
    return std::nullopt;
  }
  virtual bool fetch(RowId id, Row& out) = 0;
  // A row the store holds in memory (a memory table's, or a row a persistent table remembers
  // inside a transaction), to be read where it is instead of copied: it stays as it was when
  // asked, whatever is written or removed after (the store copies a row still shared before
  // changing it). It may hold fewer values than the schema has columns: the missing ones are
  // their kinds' defaults. Null when the store holds no such row (the caller fetches a copy).
  virtual std::shared_ptr<const Row> partagee(RowId id) {
    (void)id;
    return nullptr;
  }
  virtual RowId insert(const Row& row) = 0;
  // Inserts `row`, whose values a store that holds its rows in memory takes instead of copying
  // them (`row` is then left empty and `partagee` gives the row); others copy them.
  virtual RowId adopt(Row&& row) { return insert(row); }
  // Writes the columns flagged in `changees` (those the caller changed since it read the row);
  // an empty mask writes every column.
  virtual void update(RowId id, const Row& row, const std::vector<bool>& changees) = 0;
  virtual void remove(RowId id) = 0;
  virtual int64_t removeAll(const std::vector<Criterion>& criteria) = 0;
  virtual int64_t count(const std::vector<Criterion>& criteria) = 0;
};

// A value made to fit a column: converted to the column's kind, or nullopt when it does not.
std::optional<Valeur> fitColumn(const ColumnInfo& col, const Valeur& v);
// The default value of a column kind (empty text, 0, empty date, 0.00).
Valeur defaultOf(ColKind k);
// The same, one value per kind for the life of the program.
const Valeur& defautDe(ColKind k);

}  // namespace quarvo::host
