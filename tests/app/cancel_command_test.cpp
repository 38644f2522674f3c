// The cancellation of a selection from the command line, on the demo company once its pieces
// are linked: what it prints, what it leaves in the link table and on the budget lines.
#include <gtest/gtest.h>

#include <optional>
#include <sstream>

#include "app/CancelCommand.h"
#include "app/FiguresCommand.h"
#include "app/Workspace.h"
#include "host/table/Table.h"
#include "support/Audit.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using app::CancelSelection;
using host::Table;
using host::Valeur;

class CancelCommandTest : public ::testing::Test {
 protected:
  void SetUp() override {
    ASSERT_NO_FATAL_FAILURE(test::imputerUneCommandeSurDeuxLignes(t_));
    ASSERT_EQ(liens(), 11);
  }
  int64_t liens(const std::string& piece = {}) {
    Table t(nullptr, "VOVOVA", "QUARVO", "TEST");
    if (!piece.empty()) t.ajouterCritere("PIECE", '=', Valeur::chaine(piece));
    return t.compter();
  }
  int check() {
    std::ostringstream out;
    return app::runCheck(t_.session(), std::nullopt, false, out);
  }
  test::TestSession t_{true};
};

TEST_F(CancelCommandTest, CancelsTheOrdersButThoseKeptAndShowsTheLinesTheyCorrected) {
  CancelSelection s;
  s.kind = "C";
  s.keep = {"CF26000002", "CF26000004"};
  std::ostringstream out;
  ASSERT_EQ(app::runCancelSelection(t_.session(), s, out), 0) << out.str();
  EXPECT_EQ(out.str(),
            "4 linked piece(s) in the selection:\n"
            "Kind  Piece       Date        Amount\n"
            "CF    CF26000001  02/03/2026  1350.00\n"
            "CF    CF26000002  10/04/2026  1260.00\n"
            "CF    CF26000003  05/05/2026  3600.00\n"
            "CF    CF26000004  01/06/2026  360.00\n"
            "Kept: CF26000002 CF26000004\n"
            "Budget line  Committed before  after  Realised before  after\n"
            "0000000211   720.00            0.00   1035.00          1035.00\n"
            "0000000212   630.00            0.00   0.00             0.00\n"
            "0000000213   3600.00           0.00   1764.00          1764.00\n"
            "2 piece(s) cancelled, 3 link(s) removed.\n");
  EXPECT_EQ(liens("CF26000001") + liens("CF26000003"), 0);
  EXPECT_EQ(liens("CF26000002") + liens("CF26000004"), 2);
  EXPECT_EQ(liens(), 8);
  EXPECT_EQ(check(), 0);
  EXPECT_EQ(t_.session().fenetresOuvertes(), 0u);
  Table travail(nullptr, "VOVOVA", "M_EAPPR", "TEST");
  EXPECT_EQ(travail.compter(), 0);
}

TEST_F(CancelCommandTest, ADryRunListsAndChangesNothing) {
  CancelSelection s;
  s.from = "2026-04-01";
  s.to = "30/04/2026";
  s.project = "AFF002";
  s.keep = {"BR26000002"};
  s.dryRun = true;
  std::ostringstream out;
  ASSERT_EQ(app::runCancelSelection(t_.session(), s, out), 0) << out.str();
  EXPECT_EQ(out.str(),
            "3 linked piece(s) in the selection:\n"
            "Kind  Piece       Date        Amount\n"
            "BF    BR26000002  25/04/2026  950.00\n"
            "CF    CF26000002  10/04/2026  1260.00\n"
            "FF    FF26000003  30/04/2026  950.00\n"
            "Kept: BR26000002\n"
            "Dry run: 2 piece(s) would be cancelled; nothing was changed.\n");
  EXPECT_EQ(liens(), 11);
  EXPECT_EQ(t_.session().fenetresOuvertes(), 0u);

  std::ostringstream none;
  s = CancelSelection{};
  s.numbers = "CF26000009:CF26000010";
  EXPECT_EQ(app::runCancelSelection(t_.session(), s, none), 0);
  EXPECT_EQ(none.str(), "No linked piece in the selection: nothing to cancel.\n");
}

TEST_F(CancelCommandTest, BadValuesAreUsageErrorsAndARefusalFailsTheRun) {
  std::ostringstream out;
  auto refused = [&](auto change) {
    CancelSelection s;
    change(s);
    EXPECT_THROW(app::runCancelSelection(t_.session(), s, out), app::UsageError);
  };
  refused([](CancelSelection& s) { s.kind = "X"; });
  refused([](CancelSelection& s) { s.numbers = "CF26000001"; });
  refused([](CancelSelection& s) { s.from = "32/01/2026"; });
  refused([](CancelSelection& s) { s.project = "AFF999"; });
  // A piece to keep that is not listed: said before anything is cancelled.
  refused([](CancelSelection& s) {
    s.kind = "C";
    s.keep = {"BR26000001"};
  });
  EXPECT_EQ(liens(), 11);
  EXPECT_EQ(t_.session().fenetresOuvertes(), 0u);

  // The screen itself refuses to open without a readable company.
  t_.sql(R"(UPDATE "AFSOCI" SET "CODE" = 'AUTRE')");
  std::ostringstream refusal;
  EXPECT_EQ(app::runCancelSelection(t_.session(), CancelSelection{}, refusal), 1);
  EXPECT_EQ(refusal.str().rfind("The cancellation screen did not open: [14] Impossible de lire", 0),
            0u)
      << refusal.str();
  EXPECT_EQ(liens(), 11);
}

}  // namespace
}  // namespace quarvo
