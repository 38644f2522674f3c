// "quarvo analyse KIND IDENT": the accounting analysis of one purchasing piece from the command
// line.
//
// KIND is the piece's header table ("GAPECOM", "GAPEBL", "GAPEFAC") or its short code ("CF",
// "BF", "FF"), in any case; IDENT the piece's identifier, or its document number
// ("CF26000001"). The analysis runs silently ("QUARVO-ANALYSER" with "P_MUET" 1); the error
// rows it added to "IMM_ERREUR" are then printed as a table (number, component, code,
// designation, comment), followed by a one-line verdict. Returns 1 when the analysis found a
// problem, 0 when the piece is ready for the accounting link. An unknown kind or piece throws
// UsageError (exit code 2), having analysed nothing.
#pragma once

#include <iosfwd>
#include <string>

#include "host/session/Session.h"

namespace quarvo::app {

int runAnalyse(host::Session& session, const std::string& kind, const std::string& ident,
               std::ostream& out);

}  // namespace quarvo::app
