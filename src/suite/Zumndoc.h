// "ZUMNDOC": document numbering.
//
// Rule: "ATTRIBUE_NUMERO" takes six values: the base, "NUMEROS", the table to number, an empty
// text, the width and the identifier by reference (callers give the first five in either order,
// so the table is recognised as the value that is neither the base, "NUMEROS", empty nor a
// number; the identifier is always last). It takes the next number of that table's counter in
// "ZUMNDOC" ("MODULE" = table, "NOM" = "NUMEROS", "BASE" = base) in a transaction of its own
// (or of the caller's), so no two callers, even in two processes, ever get the same number. A
// counter that does not exist yet starts above the highest numeric identifier of the table.
// The identifier is the number zero-padded to the width (10 by default). "VALIDE_NUMERO"
// confirms a number: it fails when the number was never given out.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Zumndoc : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Zumndoc(host::Evt* evt);

 private:
  struct Request {
    std::string base = "VOVOVA";
    std::string table;
    int width = 10;
  };
  static Request parse(const host::Evt* evt);
  void attribuer(host::Evt* evt);
  void valider(host::Evt* evt);
};

}  // namespace quarvo::suite
