// What the body of an SQLite trigger writes, read from its CREATE TRIGGER text.
//
// Internal to the SQLite store (src/host/table). A statement that fires a trigger writes, behind
// the store's back, every table the trigger's body updates, inserts into or deletes from: the
// store must forget what it remembers of those tables. lireDeclencheur reads the body's
// statements for the tables they write; anything it does not understand is reported as such,
// and the store then assumes every table may change. A plain value: the caller owns it.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace quarvo::host {

struct EcritureDeclencheur {
  std::string table;  // upper case, without its schema name
  // "UPDATE <own table> ... WHERE rowid = NEW.rowid": only the row that fired the trigger,
  // which the store reads again anyway.
  bool ligneDeclencheuse = false;
};

struct Declencheur {
  bool compris = false;  // false: the body may write anything
  std::vector<EcritureDeclencheur> ecritures;
};

// Reads the text of a CREATE TRIGGER on `table` (any case).
Declencheur lireDeclencheur(std::string_view sql, std::string_view table);

}  // namespace quarvo::host
