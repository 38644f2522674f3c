#include "host/table/Table.h"

#include "host/UException.h"
#include "host/automate/Automate.h"
#include "host/session/Session.h"
#include "host/table/MemoryStore.h"

namespace quarvo::host {

Table::Table(Automate* owner, std::string base, std::string name, std::string context, const char*,
             const char*, char, int)
    : owner_(owner),
      base_(std::move(base)),
      name_(std::move(name)),
      context_(std::move(context)),
      isRecord_(name_.rfind("I_", 0) == 0) {
  if (owner_ != nullptr) owner_->enregistrerTable(this);
}

Table::~Table() {
  if (owner_ != nullptr) owner_->oublierTable(this);
}

Session& Table::session() {
  return owner_ != nullptr ? owner_->session() : Session::current();
}

TableStore& Table::store() {
  if (store_ == nullptr) {
    store_ = session().store(name_);
    if (store_ == nullptr) throw UException("unknown table " + name_);
  }
  return *store_;
}

std::filesystem::path Table::repSGBD() {
  auto dir = Session::current().db().path().parent_path();
  return dir.empty() ? std::filesystem::path(".") : dir;
}

void Table::effacerCriteres() {
  criteria_.clear();
  open_ = false;
}

void Table::ajouterCritere(const std::string& column, char op, const Valeur& value, char) {
  criteria_.push_back({column, op, value});
  open_ = false;
}

int Table::ouvrir() {
  selection_ = store().select(criteria_);
  open_ = true;
  position_ = 0;
  return selection_.empty() ? 1 : 0;
}

bool Table::ouvrirTrie(const std::vector<std::string>& tri) {
  if (tri.empty()) {
    ouvrir();  // key order is the order asked
    return true;
  }
  auto ids = store().selectTriee(criteria_, tri);
  if (!ids) return false;
  selection_ = std::move(*ids);
  open_ = true;
  position_ = 0;
  return true;
}

void Table::load(RowId id) {
  current_ = id;
  changees_.clear();
  // A row the store remembers is read where it is; it is copied into the buffer only when the
  // cursor writes into it.
  partagee_ = store().partagee(id);
  if (partagee_) return;
  if (!store().fetch(id, buffer_)) current_ = 0;
}

void Table::detacher() {
  if (!partagee_) return;
  buffer_ = *partagee_;
  partagee_.reset();
  const auto& cols = store().schema().columns();
  for (size_t i = buffer_.values.size(); i < cols.size(); ++i) {
    buffer_.values.push_back(defaultOf(cols[i].kind));
  }
}

int Table::aller(RowId id) {
  load(id);
  return current_ != 0 ? 0 : 1;
}

void Table::poserLigne(RowId id, Row&& row) {
  partagee_.reset();
  current_ = id;
  changees_.clear();
  buffer_ = std::move(row);
}

int Table::lire(int mode, char) {
  if (isRecord_) return static_cast<MemoryStore&>(store()).size() > 0 ? 0 : 1;
  if (!open_) ouvrir();
  switch (mode) {
    case 3:
      position_ = 0;
      break;
    case 4:
      if (selection_.empty()) {
        current_ = 0;
        return 1;
      }
      position_ = selection_.size() - 1;
      break;
    default:
      break;
  }
  // Rows deleted by someone else since the selection was made are passed over.
  while (position_ < selection_.size()) {
    load(selection_[position_++]);
    if (current_ != 0) return 0;
  }
  current_ = 0;
  return 1;
}

int Table::chercher(int mode, const std::string& column, char op, const Valeur& value) {
  effacerCriteres();
  ajouterCritere(column, op, value);
  return lire(mode);
}

void Table::preparer() {
  partagee_.reset();
  current_ = 0;
  const auto& cols = store().schema().columns();
  buffer_.values.clear();
  buffer_.nulles.clear();
  for (const auto& c : cols) buffer_.values.push_back(defaultOf(c.kind));
  changees_.clear();
}

int Table::inserer() {
  if (isRecord_) return 1;
  detacher();
  try {
    current_ = store().adopt(std::move(buffer_));
    changees_.clear();
    // A memory table took the buffer: its row is read where it is from now on.
    partagee_ = store().partagee(current_);
  } catch (const ConstraintError&) {
    return 1;
  }
  return 0;
}

int Table::modifier() {
  if (isRecord_) return 0;
  if (current_ == 0) return 1;
  if (partagee_) return 0;  // nothing written since the row was read
  try {
    // A full-width mask: an empty one would mean every column.
    changees_.resize(store().schema().columns().size(), false);
    store().update(current_, ligne(), changees_);
    changees_.clear();
  } catch (const ConstraintError&) {
    return 1;
  }
  return 0;
}

int Table::supprimer(char) {
  if (current_ == 0 || isRecord_) return 1;
  store().remove(current_);
  current_ = 0;
  return 0;
}

int64_t Table::supprimerTout() {
  if (isRecord_) {
    auto& mem = static_cast<MemoryStore&>(store());
    auto n = static_cast<int64_t>(mem.size());
    mem.clear();
    return n;
  }
  current_ = 0;
  open_ = false;
  return store().removeAll(criteria_);
}

int64_t Table::compter() {
  return store().count(criteria_);
}

const Row& Table::ligne() {
  if (isRecord_) return static_cast<MemoryStore&>(store()).firstRow();
  detacher();  // whole, as the schema has it
  return buffer_;
}

const Valeur& Table::valeur(std::string_view column) {
  static const Valeur aucune;
  TableStore& s = store();
  auto i = s.schema().index(column);
  if (!i) {
    if (s.extensible()) return aucune;
    throw UException("table " + name_ + " has no column " + std::string(column));
  }
  const Row& row = isRecord_   ? static_cast<MemoryStore&>(s).firstRow()
                   : partagee_ ? *partagee_
                               : buffer_;
  if (*i < row.values.size()) return row.values[*i];
  return defautDe(s.schema().columns()[*i].kind);
}

bool Table::ecrire(std::string_view column, const Valeur& value) {
  Valeur copie = value;
  return ecrire(column, std::move(copie));
}

bool Table::ecrire(std::string_view column, Valeur&& value) {
  TableStore& s = store();
  auto i = s.schema().index(column);
  if (!i) {
    if (!s.extensible()) return false;
    i = s.schema().add({std::string(column), colKindOfValue(value.kind())});
  }
  const ColumnInfo& col = s.schema().columns()[*i];
  if (value.kind() != valueKindOf(col.kind)) {
    auto fitted = fitColumn(col, value);
    if (!fitted) return false;
    value = std::move(*fitted);
  }
  detacher();
  Row& row = isRecord_ ? static_cast<MemoryStore&>(s).firstRow() : buffer_;
  if (row.values.size() <= *i) {
    size_t from = row.values.size();
    row.values.resize(s.schema().columns().size());
    for (size_t k = from; k < row.values.size(); ++k) {
      row.values[k] = defaultOf(s.schema().columns()[k].kind);
    }
  }
  // Only a column whose stored value changes is written: the store then maintains only the
  // indexes, and fires only the triggers, of what really changed.
  Valeur& cible = row.values[*i];
  bool change = row.nulle(*i) || cible.kind() != value.kind() || !(cible == value);
  cible = std::move(value);
  if (!isRecord_ && change) {
    if (changees_.size() <= *i) changees_.resize(s.schema().columns().size(), false);
    changees_[*i] = true;
  }
  return true;
}

}  // namespace quarvo::host
