// `quarvo impute`: the imputation of purchasing pieces to budget lines from the command line.
//
// Without selection options it runs the automatic imputation (every piece up to the end of the
// current month, with arbitration). With options it runs the pointing with them, then the
// writer; `dry_run` points only and prints the proposal. Both end with a summary: pieces
// pointed, imputed, in error, link rows written.
#pragma once

#include <iosfwd>
#include <istream>
#include <optional>
#include <string>

#include "host/session/Session.h"

namespace quarvo::app {

struct ImputeOptions {
  std::optional<std::string> from;  // dd/mm/yyyy or yyyy-mm-dd
  std::optional<std::string> to;
  std::optional<std::string> kind;     // T, C, B or F
  std::optional<std::string> numbers;  // MIN:MAX, either side may be empty
  std::optional<std::string> project;
  bool arbitration = false;
  bool dryRun = false;
  // The imputation selection screen with the selection typed in, advanced to its proposal.
  bool review = false;
  std::optional<std::string> script;  // with review: actions played on the screen afterwards
  bool selection() const { return from || to || kind || numbers || project || dryRun; }
};

int runImpute(host::Session& session, const ImputeOptions& options, std::ostream& out);

// `quarvo impute --review`: the imputation selection "QUARVO-IMPUTER" worked through the action
// interface. The selection is typed into the screen, "AVANCER" pressed and its question (431)
// answered yes, since running the command asked for it; the proposal (pieces, lines,
// allocations, errors) is printed. Without a script nothing more happens: the screen is left and
// nothing is written. A script (`script`, "-" the standard input) then plays its actions as
// `quarvo screen` does (it answers its own questions: with a script the question 431 is left to
// it), and the summary of what was imputed follows. Exit 0, or 1 when the screen refused an
// action; usage errors as `impute` (and --review with --arbitration or --dry-run).
int runImputeReview(host::Session& session, const ImputeOptions& options, std::istream& in,
                    std::ostream& out, std::ostream& err);

}  // namespace quarvo::app
