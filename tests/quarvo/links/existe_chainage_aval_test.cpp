#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using namespace host;

struct Answer {
  std::string type;
  std::string ident;
  int outcome;
};

Answer lookup(test::TestSession& t, const std::string& type, const std::string& ident) {
  Field typeCible("TC", "", "", 4, Kind::Entier, Valeur::entier(99), nullptr);
  Field identCible("IC", "", "", 4, Kind::Chaine, Valeur::chaine("stale"), nullptr);
  EvtParamRef evt{val(type), val(ident), ref(typeCible), ref(identCible)};
  AutomatePtr a = t.session().creer("QUARVO-EXISTE_CHAINAGE_AVAL", &evt);
  a->executer(&evt);
  EXPECT_TRUE(a->termine());
  return {typeCible.text(), identCible.text(), a->outcome()};
}

TEST(ExisteChainageAvalTest, FindsTheLastDownstreamPieceOfTheExactSource) {
  test::TestSession t;
  t.sql(R"(INSERT INTO "CHAINAGE" ("CLE_SRC", "TYPE_DST", "IDE_DST") VALUES
             ('-2|123|1', -3, 'B-OF-123'),
             ('-2|12|1', -3, 'B-OF-12'),
             ('-2|12|2', -4, 'F-OF-12'),
             ('-3|12|1', -4, 'F-OF-RECEIPT-12'))");
  Answer a = lookup(t, "-2", "12");
  EXPECT_EQ(a.type, "-4");  // the last row of the selection, in key order
  EXPECT_EQ(a.ident, "F-OF-12");
  EXPECT_EQ(a.outcome, 0);
  Answer b = lookup(t, "-2", "123");
  EXPECT_EQ(b.ident, "B-OF-123");
  Answer c = lookup(t, "-3", "12");
  EXPECT_EQ(c.ident, "F-OF-RECEIPT-12");
}

TEST(ExisteChainageAvalTest, NoDownstreamPieceClearsBothResultsAndFails) {
  test::TestSession t;
  t.sql(
      R"(INSERT INTO "CHAINAGE" ("CLE_SRC", "TYPE_DST", "IDE_DST") VALUES ('-2|123|1', -3, 'B'))");
  Answer a = lookup(t, "-2", "12");  // 12 must not match the rows of 123
  EXPECT_EQ(a.type, "0");
  EXPECT_EQ(a.ident, "");
  EXPECT_EQ(a.outcome, 1);
  EXPECT_EQ(t.ui().transcriptText(), "");  // finding nothing is no error: nothing is shown
}

}  // namespace
}  // namespace quarvo
