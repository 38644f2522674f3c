// The interface automaton of every table-backed sibling module ("AFLBUD", "AFAFFA", "GAPECOM",
// ...): one implementation, the table being the module's name.
//
// Rule: "LECTURE" (parameter 0 = "IDENT"), "LECTURE_CODE" (parameter 0 = "CODE") and
// "LECTURE_NUMERO_DOC" (parameter 0 = "NUMERO_DOC") read the first row with that value into the
// session's interface record "I_<table>" and fail, leaving the record empty, when there is none.
// "ECRITURE" writes the record back to the table: the row whose "IDENT" is parameter 0 (or the
// record's own "IDENT") is updated, or inserted when it does not exist; it fails when the record
// has no identifier.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

// Stamps the current row of a purchasing piece's header with the day and time of its change
// ("DATE_MAJ", "HEURE_MAJ"): a linked piece whose stamp differs from its links' has changed since
// it was linked. Writes the row's columns, not the database.
void horodater(host::Table& piece);

class TableInterface : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit TableInterface(host::Evt* evt);
  void init(host::Evt* evt) override;

 protected:
  // The module's table ("AFLBUD" for "AFLBUD-INTERFACE").
  std::string table() const;
  // Reads the first row with `column` = `value` into "I_<table>"; false when there is none.
  bool lireDans(const std::string& column, const host::Valeur& value);
  void ecriture(host::Evt* evt);
};

}  // namespace quarvo::suite
