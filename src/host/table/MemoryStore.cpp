#include "host/table/MemoryStore.h"

#include <algorithm>

namespace quarvo::host {

ColKind colKindOfValue(Kind k) {
  switch (k) {
    case Kind::Entier:
      return ColKind::Integer;
    case Kind::Double:
    case Kind::Simple:
      return ColKind::Real;
    case Kind::Monnaie:
      return ColKind::Decimal;
    case Kind::Date:
      return ColKind::Date;
    default:
      return ColKind::Text;
  }
}

bool matches(const Valeur& value, const Criterion& c) {
  switch (c.op) {
    case '/': {
      std::string text = value.toChaine();
      std::string prefix = c.value.toChaine();
      return text.compare(0, prefix.size(), prefix) == 0;
    }
    case '+':
      return Valeur::compare(value, c.value) >= 0;
    case '-':
      return Valeur::compare(value, c.value) <= 0;
    default:
      return Valeur::compare(value, c.value) == 0;
  }
}

Valeur MemoryStore::cell(const Row& row, size_t i) const {
  if (i < row.values.size()) return row.values[i];
  return defaultOf(schema_.columns()[i].kind);
}

bool MemoryStore::rowMatches(const Row& row, const std::vector<Criterion>& criteria) const {
  for (const auto& c : criteria) {
    auto i = schema_.index(c.column);
    Valeur v = i ? cell(row, *i) : Valeur();
    if (!matches(v, c)) return false;
  }
  return true;
}

std::string MemoryStore::indexText(const Row& row) const {
  return cell(row, schema_.key().front()).toChaine();
}

void MemoryStore::indexAdd(RowId id, const Row& row) {
  if (!schema_.key().empty()) index_.emplace(indexText(row), id);
}

void MemoryStore::indexRemove(RowId id, const Row& row) {
  if (schema_.key().empty()) return;
  auto [from, to] = index_.equal_range(indexText(row));
  for (auto it = from; it != to; ++it) {
    if (it->second == id) {
      index_.erase(it);
      return;
    }
  }
}

std::vector<RowId> MemoryStore::select(const std::vector<Criterion>& criteria) {
  std::vector<RowId> ids;
  const Criterion* indexed = nullptr;
  if (!schema_.key().empty()) {
    const std::string& first = schema_.columns()[schema_.key().front()].name;
    for (const auto& c : criteria) {
      if (c.column == first && (c.op == '=' || c.op == '/')) indexed = &c;
    }
  }
  if (indexed != nullptr) {
    std::string text = indexed->value.toChaine();
    auto from = index_.lower_bound(text);
    auto to = indexed->op == '=' ? index_.upper_bound(text) : index_.end();
    for (auto it = from; it != to; ++it) {
      if (indexed->op == '/' && it->first.compare(0, text.size(), text) != 0) break;
      if (rowMatches(*rows_.at(it->second), criteria)) ids.push_back(it->second);
    }
    std::sort(ids.begin(), ids.end());
  } else {
    for (const auto& [id, row] : rows_) {
      if (rowMatches(*row, criteria)) ids.push_back(id);
    }
  }
  const auto& key = schema_.key();
  if (!key.empty()) {
    std::stable_sort(ids.begin(), ids.end(), [&](RowId a, RowId b) {
      const Row& ra = *rows_.at(a);
      const Row& rb = *rows_.at(b);
      for (size_t k : key) {
        int c = Valeur::compare(cell(ra, k), cell(rb, k));
        if (c != 0) return c < 0;
      }
      return false;
    });
  }
  return ids;
}

bool MemoryStore::fetch(RowId id, Row& out) {
  auto it = rows_.find(id);
  if (it == rows_.end()) return false;
  const Row& row = *it->second;
  out = row;
  out.values.resize(schema_.columns().size());
  for (size_t i = row.values.size(); i < out.values.size(); ++i) {
    out.values[i] = defaultOf(schema_.columns()[i].kind);
  }
  return true;
}

std::shared_ptr<const Row> MemoryStore::partagee(RowId id) {
  auto it = rows_.find(id);
  if (it == rows_.end()) return nullptr;
  return it->second;
}

Row& MemoryStore::modifiable(std::shared_ptr<Row>& row) {
  if (row.use_count() > 1) row = std::make_shared<Row>(*row);
  return *row;
}

RowId MemoryStore::insert(const Row& row) {
  RowId id = next_++;
  rows_.emplace(id, std::make_shared<Row>(row));
  indexAdd(id, row);
  return id;
}

RowId MemoryStore::adopt(Row&& row) {
  RowId id = next_++;
  const Row& stored = *rows_.emplace(id, std::make_shared<Row>(std::move(row))).first->second;
  indexAdd(id, stored);
  return id;
}

void MemoryStore::update(RowId id, const Row& row, const std::vector<bool>& changees) {
  auto it = rows_.find(id);
  if (it == rows_.end()) return;
  indexRemove(id, *it->second);
  Row& stored = modifiable(it->second);
  if (!changees.empty() && stored.values.size() == row.values.size()) {
    for (size_t i = 0; i < changees.size() && i < row.values.size(); ++i) {
      if (changees[i]) stored.values[i] = row.values[i];
    }
  } else {
    stored = row;
  }
  indexAdd(id, stored);
}

void MemoryStore::remove(RowId id) {
  auto it = rows_.find(id);
  if (it == rows_.end()) return;
  indexRemove(id, *it->second);
  rows_.erase(it);
}

int64_t MemoryStore::removeAll(const std::vector<Criterion>& criteria) {
  int64_t n = 0;
  for (auto it = rows_.begin(); it != rows_.end();) {
    if (rowMatches(*it->second, criteria)) {
      indexRemove(it->first, *it->second);
      it = rows_.erase(it);
      ++n;
    } else {
      ++it;
    }
  }
  return n;
}

int64_t MemoryStore::count(const std::vector<Criterion>& criteria) {
  int64_t n = 0;
  for (const auto& [id, row] : rows_) n += rowMatches(*row, criteria) ? 1 : 0;
  return n;
}

void MemoryStore::setKey(const std::vector<std::string>& columns) {
  std::vector<size_t> key;
  for (const auto& c : columns) key.push_back(schema_.add({c, ColKind::Text}));
  schema_.setKey(std::move(key));
  index_.clear();
  for (const auto& [id, row] : rows_) indexAdd(id, *row);
}

// Interface records are written in place through this row; they carry no key, so no index
// needs to follow.
Row& MemoryStore::firstRow() {
  if (rows_.empty()) insert(Row{});
  Row& row = modifiable(rows_.begin()->second);
  if (row.values.size() < schema_.columns().size()) {
    size_t from = row.values.size();
    row.values.resize(schema_.columns().size());
    for (size_t i = from; i < row.values.size(); ++i) {
      row.values[i] = defaultOf(schema_.columns()[i].kind);
    }
  }
  return row;
}

}  // namespace quarvo::host
