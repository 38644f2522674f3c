// `quarvo impute`: the imputation of purchasing pieces to budget lines from the command line.
//
// Without selection options it runs the automatic imputation (every piece up to the end of the
// current month, with arbitration). With options it runs the pointing with them, then the
// writer; `dry_run` points only and prints the proposal. Both end with a summary: pieces
// pointed, imputed, in error, link rows written.
#pragma once

#include <iosfwd>
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
  bool selection() const { return from || to || kind || numbers || project || dryRun; }
};

int runImpute(host::Session& session, const ImputeOptions& options, std::ostream& out);

}  // namespace quarvo::app
