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

#include <cstdint>
#include <functional>
#include <string>

#include "host/automate/Interface2.h"

namespace quarvo::suite {

// Advances a numbering counter, the "ZUMNDOC" row of `base`, `module` and `nom`, and gives its
// new value. A counter that does not exist yet is created at `premier()` (the caller's rule for
// starting above what its table already holds). 0 when the counter cannot be written.
// REQUIRES: the caller holds the write lock (a transaction is open), so no two callers get the
// same value.
int64_t avancerCompteur(host::Automate& caller, const std::string& base, const std::string& module,
                        const std::string& nom, const std::function<int64_t()>& premier);

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
