// A column of the current row of a cursor, read and written like a field.
//
// The cursor owns the row; the column only names it. List columns (three amounts joined by ';')
// are read and written by index with `at` / `setAt`.
#pragma once

#include <string>

#include "host/table/Table.h"

namespace quarvo::host {

class Champ {
 public:
  Champ(std::string column, Table& table, int unused = 1);

  const std::string& name() const { return column_; }
  Table& table() { return table_; }
  // Valid until the cursor moves or is written to.
  const Valeur& valeur() const { return table_.valeur(column_); }
  bool set(const Valeur& v) { return table_.ecrire(column_, v); }
  bool set(const std::string& text) { return set(Valeur::chaine(text)); }
  bool set(const char* text) { return set(Valeur::chaine(text)); }
  bool set(int64_t n) { return set(Valeur::entier(n)); }
  bool set(int n) { return set(Valeur::entier(n)); }
  bool set(double d) { return set(Valeur::dbl(d)); }
  bool set(const Monnaie& m) { return set(Valeur::monnaie(m)); }
  bool set(const Date& d) { return set(Valeur::date(d)); }

  std::string text() const { return valeur().toChaine(); }
  int64_t entier() const;
  double dbl() const;
  Monnaie monnaie() const;
  Date date() const;

  // Element `i` of a list column ("VREA"[1]); 0 when absent.
  Monnaie at(size_t i) const;
  void setAt(size_t i, const Monnaie& m);

 private:
  std::string column_;
  Table& table_;
};

// Splits and joins the stored form of list columns ("1.00;2.00;3.00").
std::vector<std::string> splitList(const std::string& stored);
std::string joinList(const std::vector<std::string>& items);

}  // namespace quarvo::host
