#include <gtest/gtest.h>

#include "quarvo/import/ImportSupport.h"

namespace quarvo {
namespace {

using test::requete;

int solder(test::TestSession& t, const std::string& table, const std::string& ident) {
  host::EvtParamVal evt{host::val(table), host::val(ident)};
  return t.session().appelerModule("QUARVO-SOLDER", &evt);
}

TEST(SolderTest, AnOrderSettlesItsOpenLinesLotsStockAndHeader) {
  test::TestSession t(true);
  // Order CF26000002: line 413 fully received (nothing to settle), line 414 not at all, with
  // a lot and 20 valves expected in stock.
  EXPECT_EQ(solder(t, "GAPECOM", "0000000402"), 0);
  EXPECT_EQ(requete(t, R"(SELECT IDENT, QTE, QTT, QTE_SOLDEE FROM "GAPLCOM"
                           WHERE NUMERO LIKE '0000000402|%' ORDER BY IDENT)"),
            "0000000413|10.0|10.0|0.0\n0000000414|20.0|0.0|20.0\n");
  EXPECT_EQ(requete(t, R"(SELECT QTE_ATTENDUE FROM "GCPSTOCK" WHERE IDENT = '0000000196')"),
            "0.0\n");
  EXPECT_EQ(requete(t, R"(SELECT SOLDE FROM "GAPLOT" WHERE IDENT = '0000000881')"), "1\n");
  // Not everything was carried forward: the piece is settled for what was.
  EXPECT_EQ(
      requete(
          t, R"(SELECT SOLDEE, QTNT, MTNT_HT, MTNT_TTC FROM "GAPECOM" WHERE IDENT = '0000000402')"),
      "1|0.0|950.00|1140.00\n");
}

TEST(SolderTest, ReceiptsNeverTouchLotsAndOtherTablesOrPiecesFail) {
  test::TestSession t(true);
  t.sql(R"(UPDATE "GAPLBL" SET "QTT" = 6 WHERE "IDENT" = '0000000513';
           INSERT INTO "GAPLOT" ("IDENT", "TYPE_PIECE", "PIECE_IDENT", "LIGNE_IDENT", "QTE")
           VALUES ('0000000882', -3, '0000000502', '0000000513', 4);
           INSERT INTO "GAPEDEV" ("IDENT", "NUMERO_DOC", "GCPFOUR_IDENT", "HT", "TTC")
           VALUES ('0000000302', 'DF-SANS-LIGNE', '0000000124', '10.00', '12.00'))");
  EXPECT_EQ(solder(t, "GAPEBL", "0000000502"), 0);
  EXPECT_EQ(requete(t, R"(SELECT QTE_SOLDEE FROM "GAPLBL" WHERE IDENT = '0000000513')"), "4.0\n");
  EXPECT_EQ(requete(t, R"(SELECT SOLDE FROM "GAPLOT" WHERE IDENT = '0000000882')"), "0\n");
  EXPECT_EQ(requete(t, R"(SELECT SOLDEE, MTNT_HT FROM "GAPEBL" WHERE IDENT = '0000000502')"),
            "1|950.00\n");
  // All carried forward (QTT = QTNT = 0): settled for its full amounts.
  EXPECT_EQ(solder(t, "GAPEDEV", "0000000302"), 0);
  EXPECT_EQ(
      requete(t, R"(SELECT SOLDEE, MTNT_HT, MTNT_TTC FROM "GAPEDEV" WHERE IDENT = '0000000302')"),
      "1|10.00|12.00\n");

  std::string before =
      requete(t, R"(SELECT * FROM "GAPEFAC")") + requete(t, R"(SELECT * FROM "GAPLCOM")");
  EXPECT_EQ(solder(t, "GAPEFAC", "0000000601"), 1);
  EXPECT_EQ(solder(t, "GAPECOM", "0000009999"), 1);
  EXPECT_EQ(requete(t, R"(SELECT * FROM "GAPEFAC")") + requete(t, R"(SELECT * FROM "GAPLCOM")"),
            before);
  EXPECT_EQ(t.ui().transcriptText(), "");
}

}  // namespace
}  // namespace quarvo
