// "quarvo impute --review": the imputation selection screen driven to its proposal, then a
// script's actions.
#include <gtest/gtest.h>

#include <sstream>

#include "app/ImputeCommand.h"
#include "app/Workspace.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

int64_t liens() {
  host::Table t(nullptr, "VOVOVA", "QUARVO", "TEST");
  t.effacerCriteres();
  return t.compter();
}

TEST(ImputeReviewTest, TheProposalIsPrintedAndAScriptValidatesIt) {
  test::TestSession t(true);
  app::ImputeOptions o;
  o.review = true;
  o.kind = "C";
  o.project = "AFF001";
  std::istringstream rien;
  std::ostringstream out;
  std::ostringstream err;
  ASSERT_EQ(app::runImputeReview(t.session(), o, rien, out, err), 0) << out.str() << err.str();
  EXPECT_NE(out.str().find("GAPECOM CF26000003 (0000000403)  HT 3600.00\n"), std::string::npos)
      << out.str();
  EXPECT_NE(out.str().find("    -> budget line 0000000213  qty 80  HT 3600.00\n"),
            std::string::npos);
  EXPECT_NE(out.str().find("Pieces pointed: 2; imputable: 2; in error: 0 (nothing written)"),
            std::string::npos);
  EXPECT_EQ(liens(), 0);

  // A script answers the pointing's question itself, unticks a piece, validates.
  o.script = "-";
  std::istringstream script(
      "answer 1\n"
      "cell LST 1 LST_C5 N\n"
      "press VALID\n"
      "answer Oui\n"
      "press TERMINE\n");
  std::ostringstream out2;
  ASSERT_EQ(app::runImputeReview(t.session(), o, script, out2, err), 0) << out2.str();
  EXPECT_NE(out2.str().find("Link rows written: 1 new (linked amount 3600.00)"), std::string::npos)
      << out2.str();
  EXPECT_EQ(liens(), 1);
}

TEST(ImputeReviewTest, UsageErrors) {
  test::TestSession t(true);
  std::istringstream rien;
  std::ostringstream out;
  app::ImputeOptions o;
  o.review = true;
  o.dryRun = true;
  EXPECT_THROW(app::runImputeReview(t.session(), o, rien, out, out), app::UsageError);
  o.dryRun = false;
  o.to = "";
  EXPECT_THROW(app::runImputeReview(t.session(), o, rien, out, out), app::UsageError);
  o.to.reset();
  o.script = "-";
  std::istringstream mauvais("press VALID\nvalider\n");
  EXPECT_THROW(app::runImputeReview(t.session(), o, mauvais, out, out), app::UsageError);
}

}  // namespace
}  // namespace quarvo
