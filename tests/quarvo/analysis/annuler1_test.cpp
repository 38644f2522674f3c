#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using namespace host;

class Annuler1Test : public ::testing::Test {
 protected:
  Annuler1Test() : t_(true) {}
  void link(const std::string& ident, const std::string& line, const std::string& kind,
            const std::string& piece, const std::string& ht) {
    t_.sql(
        "INSERT INTO \"QUARVO\" (\"IDENT\", \"AFEBUD_IDENT\", \"AFAFFA_IDENT\", \"AFLBUD_IDENT\", "
        "\"COMPOSANT\", \"COMPOSANT_IDENT\", \"PIECE\", \"DATE_PIECE\", \"QTE\", \"HT\") VALUES "
        "('" +
        ident + "', '0000000201', '0000000011', '" + line + "', '" + kind + "', '" + piece +
        "', 'N" + piece + "', '2026-05-12', 1, '" + ht + "')");
  }
  void validate(const std::string& line) {
    EvtParamVal evt{val(line)};
    ASSERT_EQ(t_.session().appelerProcedure("QUARVO", "VALIDATION_MAJ", &evt), 0);
  }
  std::string veng(const std::string& line) { return t_.value("AFLBUD", "VENG", "IDENT", line); }
  int cancel(const std::string& kind, const std::string& piece) {
    EvtParamVal evt{val(kind), val(piece)};
    return t_.session().appelerModule("QUARVO-ANNULER1", &evt);
  }
  test::TestSession t_;
};

TEST_F(Annuler1Test, PieceOnTwoLinesLeavesBothAndOnlyItsOwnAmounts) {
  link("0000005001", "0000000211", "GAPECOM", "0000000401", "100.00");
  link("0000005002", "0000000212", "GAPECOM", "0000000401", "40.00");
  link("0000005003", "0000000211", "GAPECOM", "0000000402", "7.50");  // another piece stays
  t_.sql(
      "INSERT INTO \"AFPFST\" (\"IDENT\", \"QUARVO_IDENT\") VALUES ('0000000001', '0000005002')");
  validate("0000000211");
  validate("0000000212");
  ASSERT_EQ(veng("0000000211"), "107.50");
  ASSERT_EQ(cancel("GAPECOM", "0000000401"), 0);
  EXPECT_EQ(veng("0000000211"), "7.50");
  EXPECT_EQ(veng("0000000212"), "0.00");
  Table links(nullptr, "VOVOVA", "QUARVO", "T");
  EXPECT_EQ(links.compter(), 1);
  Table pointing(nullptr, "VOVOVA", "AFPFST", "T");
  EXPECT_EQ(pointing.compter(), 0);
  EXPECT_EQ(t_.ui().transcriptText(), "");
  // A piece without links: nothing happens.
  EXPECT_EQ(cancel("GAPEBL", "0000000501"), 0);
  EXPECT_EQ(links.compter(), 1);
}

TEST_F(Annuler1Test, UnreadableBudgetLineStillLosesTheLinkAndUnknownCompanyCancelsNothing) {
  link("0000005001", "0000009999", "GAPEFAC", "0000000601", "10.00");  // line deleted since
  EXPECT_EQ(cancel("GAPEFAC", "0000000601"), 0);
  Table links(nullptr, "VOVOVA", "QUARVO", "T");
  EXPECT_EQ(links.compter(), 0);

  link("0000005002", "0000000211", "GAPECOM", "0000000401", "100.00");
  t_.sql("UPDATE \"AFSOCI\" SET \"CODE\" = 'AUTRE'");
  EXPECT_EQ(cancel("GAPECOM", "0000000401"), 1);
  EXPECT_EQ(links.compter(), 1);
  EXPECT_NE(t_.ui().transcriptText().find("[14]"), std::string::npos);
}

}  // namespace
}  // namespace quarvo
