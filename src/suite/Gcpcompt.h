// "GCPCOMPT" and "GCPTCFG": the configuration of the accounting link, one implementation for
// both (the table being the module's name): "GCPCOMPT" when the accounting is integrated,
// "GCPTCFG" when it is transferred by file.
//
// Rule: "LECTURE_SIMPLE" (kind, key, result by reference) reads the row of the module's table
// whose "GENRE" is the kind and "CLE" the key, and hands back its "VALEUR". When no such row
// exists, or its value is empty, the key is not configured: the result is emptied and the call
// fails. Keys in use: kind "J" "ACHAT" (purchases journal), kind "*" "MACHAT" (account grouping
// mode 0 to 3), kind "C" "AFRAIS" and "APORT" (fees and carriage accounts).
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Gcpcompt : public TableInterface {
 public:
  explicit Gcpcompt(host::Evt* evt);

 private:
  void lectureSimple(host::Evt* evt);
};

}  // namespace quarvo::suite
