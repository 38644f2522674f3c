#include "host/table/Store.h"

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

std::optional<size_t> TableSchema::index(const std::string& column) const {
  auto it = index_.find(column);
  if (it == index_.end()) return std::nullopt;
  return it->second;
}

size_t TableSchema::add(ColumnInfo info) {
  if (auto i = index(info.name)) return *i;
  columns_.push_back(info);
  index_.emplace(info.name, columns_.size() - 1);
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

std::optional<Valeur> fitColumn(const ColumnInfo& col, const Valeur& v) {
  return v.convertTo(valueKindOf(col.kind));
}

}  // namespace quarvo::host
