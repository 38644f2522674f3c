// What a test on the links sets up and reads back: the demo's pieces linked with one order over
// two budget lines, and the audit of every budget line's figures against its links (as
// `quarvo check` runs it).
#pragma once

#include <gtest/gtest.h>

#include <optional>
#include <sstream>
#include <string>

#include "app/FiguresCommand.h"
#include "host/session/Session.h"
#include "support/TestSession.h"

namespace quarvo::test {

// Success when every budget line matches its links and every link its piece; else the audit's
// report.
inline ::testing::AssertionResult sansEcart(host::Session& session) {
  std::ostringstream out;
  if (app::runCheck(session, std::nullopt, false, out) == 0) return ::testing::AssertionSuccess();
  return ::testing::AssertionFailure() << out.str();
}

// The demo's pieces imputed as the automatic imputation links them, after the switchboards of
// order CF26000001 became plumbing: that order is then linked to the electrical line 211
// (720.00) and to the plumbing line 212 (630.00).
inline void imputerUneCommandeSurDeuxLignes(TestSession& t) {
  t.sql(R"(UPDATE "GAPLCOM" SET "GCPARTIC_IDENT" = '0000000084', "GCPARTIC_CODE" = 'ROBINET-EQ'
           WHERE "NUMERO" = '0000000401|2')");
  ASSERT_EQ(t.session().appelerModule("QUARVO-IMPUTER_AUTO", nullptr), 0);
  t.session().executerEnAttente();
}

}  // namespace quarvo::test
