// "GCPTVA": VAT codes of the purchasing side, and the purchase accounts.
//
// Rule:
// - "INIT_TRANSFERT_ASCII" prepares the transfer of the accounting by file; this stand-in keeps
//   no transfer state, so it only succeeds.
// - "COMPTE_ACHAT" (criterion, VAT regime, VAT code, date, account by reference) finds the
//   purchase account in "GCPCPTACH". A row matches when each of its "CRITERE_IDENT",
//   "GCPREGM_IDENT" and "GCPTVA_IDENT" is empty (matches any) or equal to the value asked, and
//   the date lies within its "DATE_DEBUT".."DATE_FIN" (an empty bound is open; an empty date
//   only matches rows without bounds). Of the matching rows the most precise wins: a given
//   criterion weighs more than a given regime, which weighs more than a given VAT code, then a
//   dated row over an undated one, then the lowest "IDENT". The account is its "COMPTE"; when
//   no row matches (or the winner has no account) the account is emptied and the call fails.
// - "LECTURE" and "LECTURE_CODE" read a VAT code (generic).
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Gcptva : public TableInterface {
 public:
  explicit Gcptva(host::Evt* evt);

 private:
  void compteAchat(host::Evt* evt);
};

}  // namespace quarvo::suite
