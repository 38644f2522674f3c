// The cancellation of a selection of linked pieces from the command line. It works the
// cancellation screen "QUARVO-ANNULER" through the screen model as a person would: the selection
// is typed into the first tab (what is not given keeps the screen's default: no lower date, the
// end of the company's current month, every kind, every number, every project), "AVANCER" lists
// the linked pieces once the command has said yes to the screen's question, the pieces to keep
// are unmarked in the list, and "VALID", said yes to as well, cancels the others. What the
// screen shows goes to the terminal as it comes; other questions are answered by the terminal
// driver. The selection's own rules are the screen's.
//
// What is printed: the pieces listed (kind, number, date, net amount), the pieces kept, then
// the committed and realised figures of every budget line the cancelled pieces were linked to,
// before and after. A dry run lists and unmarks, then leaves the screen without cancelling.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

#include "host/session/Session.h"

namespace quarvo::app {

struct CancelSelection {
  std::string from;               // first piece date, "dd/mm/yyyy" or "yyyy-mm-dd"; empty: none
  std::string to;                 // last piece date; empty: the end of the current month
  std::string kind = "T";         // T all, C orders, B goods-received notes, F invoices
  std::string numbers;            // MIN:MAX piece numbers, either side may be empty
  std::string project;            // one project by code; empty: every project
  std::vector<std::string> keep;  // piece numbers listed but not to cancel
  bool dryRun = false;
};

// Runs the cancellation; returns 0, or 1 when the screen refused something (its refusal is
// printed). Throws UsageError for a bad selection value, an unknown project, or a piece to keep
// that the selection does not list.
int runCancelSelection(host::Session& session, const CancelSelection& selection, std::ostream& out);

}  // namespace quarvo::app
