// What a test on the links reads back: the audit of every budget line's figures against its
// links (as `quarvo check` runs it), and a table's rows in brief.
#pragma once

#include <gtest/gtest.h>

#include <optional>
#include <sstream>
#include <string>

#include "app/FiguresCommand.h"
#include "host/session/Session.h"

namespace quarvo::test {

// Success when every budget line matches its links and every link its piece; else the audit's
// report.
inline ::testing::AssertionResult sansEcart(host::Session& session) {
  std::ostringstream out;
  if (app::runCheck(session, std::nullopt, false, out) == 0) return ::testing::AssertionSuccess();
  return ::testing::AssertionFailure() << out.str();
}

}  // namespace quarvo::test
