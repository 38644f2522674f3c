// The budget-line figures from the command line: the audit of committed and realised figures
// against the links behind them (`quarvo check`), their recompute (`quarvo recompute`), and the
// cancellation of one piece's links (`quarvo cancel`).
//
// The audit uses the module's own withdraw path: inside a transaction that is rolled back, the
// line's links are withdrawn ("SUPPRESSION_MAJ"); what the line still holds afterwards is the
// drift, the part of its figures that no link explains. A fix withdraws the links, clears that
// drift and adds the links back ("VALIDATION_MAJ"), all in one transaction.
//
// The audit also checks the links against their pieces: every link row names a piece that
// exists, and the link rows of one piece, over all budget lines, never hold more quantity nor
// more amount than the piece itself (its lines' quantities and net amounts by the rule every
// linking path shares, credit notes by absolute value). A fix cannot know which of such links is
// right: it lists them, leaves them, and the audit exits 1.
//
// A budget line whose budget column names another budget than its number says is damaged (the
// database derives the budget from the number only when the number is written): the audit
// names it, and a fix gives it the budget of its number.
#pragma once

#include <iosfwd>
#include <optional>
#include <string>

#include "host/session/Session.h"

namespace quarvo::app {

// Prints the lines whose stored figures differ from their links (stored, recomputed,
// difference) and the pieces their links do not match; with `fix`, brings the figures in line and
// says what changed. Returns 0 when nothing differed, 1 when something did.
int runCheck(host::Session& session, const std::optional<std::string>& line, bool fix,
             std::ostream& out);
// Recomputes one budget line from its links; prints its figures before and after.
int runRecompute(host::Session& session, const std::string& line, std::ostream& out);
// Cancels every link of one piece and prints the budget lines it corrected.
int runCancel(host::Session& session, const std::string& kind, const std::string& ident,
              std::ostream& out);

}  // namespace quarvo::app
