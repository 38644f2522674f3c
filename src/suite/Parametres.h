// "CPPARAM" and "GCPPARAM": parameter tables of one row, one implementation for both (the
// table being the module's name). "CPPARAM" holds the integrated accounting's parameters (a
// row exists only when that accounting is set up); "GCPPARAM" the purchasing parameters
// ("SAISIE_ANA_A": 1 analytical section on the piece header, 2 on the lines).
//
// Rule: "LECTURE" without a parameter (or with an empty one) reads the table's first row (in
// key order) into "I_<table>"; with an identifier, the row of that "IDENT". It fails, leaving
// the record empty, when there is no such row, so a failed "CPPARAM" "LECTURE" means the
// integrated accounting is not set up. "LECTURE_CODE" and "ECRITURE" are the generic ones.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Parametres : public TableInterface {
 public:
  explicit Parametres(host::Evt* evt);

 private:
  void lecture(host::Evt* evt);
};

}  // namespace quarvo::suite
