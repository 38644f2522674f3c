#include "host/table/Store.h"

#include <cstdint>
#include <cstring>

namespace quarvo::host {

Kind valueKindOf(ColKind k) {
  switch (k) {
    case ColKind::Integer:
      return Kind::Entier;
    case ColKind::Real:
      return Kind::Double;
    case ColKind::Decimal:
      return Kind::Monnaie;
    case ColKind::Date:
      return Kind::Date;
    default:
      return Kind::Chaine;
  }
}

ColKind colKindFromDeclared(const std::string& declared) {
  if (declared == "INTEGER") return ColKind::Integer;
  if (declared == "REAL") return ColKind::Real;
  if (declared == "DECIMAL_TEXT") return ColKind::Decimal;
  if (declared == "DATE_TEXT") return ColKind::Date;
  if (declared == "TIME_TEXT") return ColKind::Time;
  if (declared == "DECIMAL_LIST_TEXT") return ColKind::DecimalList;
  if (declared == "DATE_LIST_TEXT") return ColKind::DateList;
  return ColKind::Text;
}

namespace {
// Column names are short and differ early or late: a hash of their length and of their first
// and last eight bytes is enough, and costs a few instructions whatever the name.
uint64_t hacher(std::string_view s) {
  uint64_t debut = 0;
  uint64_t fin = 0;
  const size_t n = s.size();
  std::memcpy(&debut, s.data(), n < 8 ? n : 8);
  if (n > 8) std::memcpy(&fin, s.data() + n - 8, 8);
  uint64_t h = (debut * 0x9E3779B97F4A7C15ull) ^ (fin * 0xC2B2AE3D27D4EB4Full) ^ n;
  return h ^ (h >> 29);
}
}  // namespace

std::optional<size_t> TableSchema::index(std::string_view column) const {
  if (slots_.empty()) return std::nullopt;
  const size_t masque = slots_.size() - 1;
  for (size_t s = hacher(column) & masque; slots_[s] != 0; s = (s + 1) & masque) {
    const std::string& nom = columns_[slots_[s] - 1].name;
    if (nom.size() == column.size() && std::memcmp(nom.data(), column.data(), nom.size()) == 0) {
      return slots_[s] - 1;
    }
  }
  return std::nullopt;
}

void TableSchema::placer(size_t position) {
  const size_t masque = slots_.size() - 1;
  size_t s = hacher(columns_[position].name) & masque;
  while (slots_[s] != 0) s = (s + 1) & masque;
  slots_[s] = static_cast<uint32_t>(position + 1);
}

size_t TableSchema::add(ColumnInfo info) {
  if (auto i = index(info.name)) return *i;
  columns_.push_back(std::move(info));
  if (columns_.size() * 2 > slots_.size()) {
    // At most half full, so that a search ends quickly on an empty slot.
    size_t taille = 16;
    while (taille < columns_.size() * 4) taille *= 2;
    slots_.assign(taille, 0);
    for (size_t i = 0; i < columns_.size(); ++i) placer(i);
  } else {
    placer(columns_.size() - 1);
  }
  return columns_.size() - 1;
}

Valeur defaultOf(ColKind k) {
  switch (k) {
    case ColKind::Integer:
      return Valeur::entier(0);
    case ColKind::Real:
      return Valeur::dbl(0.0);
    case ColKind::Decimal:
      return Valeur::monnaie(Monnaie());
    case ColKind::Date:
      return Valeur::date(Date());
    default:
      return Valeur::chaine("");
  }
}

const Valeur& defautDe(ColKind k) {
  static const std::vector<Valeur> defauts = [] {
    std::vector<Valeur> v;
    for (ColKind kind : {ColKind::Text, ColKind::Integer, ColKind::Real, ColKind::Decimal,
                         ColKind::Date, ColKind::Time, ColKind::DecimalList, ColKind::DateList}) {
      v.push_back(defaultOf(kind));
    }
    return v;
  }();
  return defauts[static_cast<size_t>(k)];
}

std::optional<Valeur> fitColumn(const ColumnInfo& col, const Valeur& v) {
  return v.convertTo(valueKindOf(col.kind));
}

}  // namespace quarvo::host
