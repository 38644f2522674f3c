// `quarvo report`: the purchase follow-up report from the command line. It drives the report's
// selection screen "QUARVO-SELETAT1" headlessly, as a user would: the screen opens with its
// defaults (the company's current month, all projects, options "11100", the user's export file),
// the given options are typed into its fields, and its OK button is pressed; the screen's own
// refusals (messages "99", "100", ...) reach the session's driver and fail the run.
#pragma once

#include <filesystem>
#include <iosfwd>
#include <optional>
#include <string>
#include <vector>

#include "host/session/Session.h"

namespace quarvo::app {

struct ReportOptions {
  std::string from;       // first day, "dd/mm/yyyy" or "yyyy-mm-dd"; empty: the screen's
  std::string to;         // last day; empty: the screen's
  std::string project;    // one project by code
  std::string budget;     // one budget by identifier (its project follows)
  std::string criterion;  // grouping criterion: AFCLIE, AFETAB, AFSERV, AFRPS1, AFRPS2, AFCRI1..5
  std::string options;    // five 0/1 characters: page per project, lines, pieces, recap 1, recap 2
  std::string states;     // budget states T, A, NC, NA or C; ":O" keeps closed budgets of the
                          // year (NC, NA) or only those (C)
  bool beforePeriod = true;          // gather the pieces before the period
  std::optional<std::string> print;  // PDF file; "" the default place
  // Export files (.xlsx for a workbook), in order; "" the screen's saved one.
  std::vector<std::string> exports;
};

struct ReportPaths {
  std::filesystem::path pdf;       // empty when not printed
  std::filesystem::path exported;  // empty when not exported
};

// Runs the report; prints where the files went on `out`. Returns 0, or 1 when the screen
// refused the selection or a file was not written. Throws UsageError for a bad option.
// With neither `print` nor `exports`, prints to the default place.
int runReport(host::Session& session, const ReportOptions& options, std::ostream& out,
              ReportPaths* paths = nullptr);

// The demo's follow-up: the whole current year of the demo projects grouped by customer, with
// both recapitulations, printed to `dir`/suivi_achats.pdf and exported to
// `dir`/suivi_achats.xlsx. Returns the two paths (empty when that output failed).
ReportPaths reportDemo(host::Session& session, const std::filesystem::path& dir);

}  // namespace quarvo::app
