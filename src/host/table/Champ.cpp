#include "host/table/Champ.h"

#include "host/field/Field.h"

namespace quarvo::host {

Champ::Champ(std::string column, Table& table, int) : column_(std::move(column)), table_(table) {}

int64_t Champ::entier() const {
  return toEntier(valeur());
}
double Champ::dbl() const {
  return toDouble(valeur());
}
Monnaie Champ::monnaie() const {
  return toMonnaie(valeur());
}
Date Champ::date() const {
  return toDate(valeur());
}

std::vector<std::string> splitList(const std::string& stored) {
  std::vector<std::string> items;
  if (stored.empty()) return items;
  size_t start = 0;
  while (true) {
    size_t semi = stored.find(';', start);
    items.push_back(stored.substr(start, semi == std::string::npos ? semi : semi - start));
    if (semi == std::string::npos) break;
    start = semi + 1;
  }
  return items;
}

std::string joinList(const std::vector<std::string>& items) {
  std::string out;
  for (size_t i = 0; i < items.size(); ++i) {
    if (i > 0) out += ';';
    out += items[i];
  }
  return out;
}

Monnaie Champ::at(size_t i) const {
  auto items = splitList(text());
  if (i >= items.size()) return Monnaie();
  auto m = Monnaie::parse(items[i]);
  return m ? *m : Monnaie();
}

void Champ::setAt(size_t i, const Monnaie& m) {
  auto items = splitList(text());
  while (items.size() < 3 || items.size() <= i) items.push_back(Monnaie().text());
  items[i] = m.text();
  set(joinList(items));
}

}  // namespace quarvo::host
