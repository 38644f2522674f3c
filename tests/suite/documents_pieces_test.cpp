// The pieces' own automata on the demo company: the transformation of a piece into the next one
// of the chain, and the settling.
#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::suite {
namespace {

using namespace host;

class DocumentsPiecesTest : public ::testing::Test {
 protected:
  int run(const std::string& automate, std::vector<Arg> args) {
    EvtParamVal evt(std::move(args));
    return t_.session().appelerModule(automate, &evt);
  }
  int64_t count(const std::string& table, const std::string& column = "",
                const std::string& value = "") {
    Table t(nullptr, "GESCOM", table, "TEST");
    if (!column.empty()) t.ajouterCritere(column, '=', Valeur::chaine(value));
    return t.compter();
  }
  std::string v(const std::string& table, const std::string& column, const std::string& ident,
                const std::string& identColumn = "IDENT") {
    return t_.value(table, column, identColumn, ident);
  }
  // Everything a transformation may write, to compare before and after a refusal.
  std::string empreinte() {
    std::string out;
    for (const char* table : {"GAPEBL", "GAPLBL", "GAPEFAC", "GAPLFAC", "CHAINAGE", "ZUMNDOC"}) {
      out += std::string(table) + "=" + std::to_string(count(table)) + " ";
    }
    Table compteurs(nullptr, "GESCOM", "ZUMNDOC", "TEST");
    while (compteurs.lire(1) == 0) out += compteurs.valeur("DERNIER").toChaine() + ",";
    Table lignes(nullptr, "GESCOM", "GAPLCOM", "TEST");
    while (lignes.lire(1) == 0) out += lignes.valeur("QTT").toChaine() + ",";
    Table entetes(nullptr, "GESCOM", "GAPECOM", "TEST");
    while (entetes.lire(1) == 0) {
      out += entetes.valeur("QTT").toChaine() + "/" + entetes.valeur("QTNT").toChaine() + "/" +
             entetes.valeur("MTNT_HT").toChaine() + ",";
    }
    return out;
  }
  std::string annee() { return std::to_string(Date::today().year() % 100); }

  test::TestSession t_{true};
};

TEST_F(DocumentsPiecesTest, AnOrderCarriesWhatItStillExpectsIntoAValidatedReceipt) {
  // CF26000002: its tubes are received, its 20 valves still expected.
  ASSERT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000402")}), 0);
  const std::string recu = "0000001001";
  EXPECT_EQ(v("GAPEBL", "NUMERO_DOC", recu), "BR" + annee() + "000003");
  EXPECT_EQ(v("GAPEBL", "ORIGINE", recu), "CF26000002");
  EXPECT_EQ(v("GAPEBL", "DESIG", recu), "Raccordement du hameau");
  EXPECT_EQ(v("GAPEBL", "DATE_CREATION", recu), Date::today().text());
  EXPECT_EQ(v("GAPEBL", "GCPFOUR_IDENT", recu), "0000000122");
  EXPECT_EQ(v("GAPEBL", "VALIDEE", recu), "1");
  EXPECT_EQ(v("GAPEBL", "HT", recu), "250.00");
  EXPECT_EQ(v("GAPEBL", "TTC", recu), "300.00");
  EXPECT_EQ(v("GAPEBL", "QTNT", recu), "20");
  ASSERT_EQ(count("GAPLBL", "NUMERO", recu + "|1"), 1);
  EXPECT_EQ(count("GAPLBL", "NUMERO", recu + "|2"), 0);  // the tubes had nothing left
  EXPECT_EQ(v("GAPLBL", "GCPARTIC_CODE", recu + "|1", "NUMERO"), "ROBINET-EQ");
  EXPECT_EQ(v("GAPLBL", "QTE", recu + "|1", "NUMERO"), "20");
  EXPECT_EQ(v("GAPLBL", "PUHT", recu + "|1", "NUMERO"), "12.50");
  EXPECT_EQ(v("GAPLBL", "SECAN_CODE", recu + "|1", "NUMERO"), "AFF002");
  // The chaining names the source line and the target line.
  EXPECT_EQ(v("CHAINAGE", "IDE_DST", "-2|0000000402|2", "CLE_SRC"), recu);
  EXPECT_EQ(v("CHAINAGE", "TYPE_DST", "-2|0000000402|2", "CLE_SRC"), "-3");
  EXPECT_EQ(v("CHAINAGE", "LIG_DST", "-2|0000000402|2", "CLE_SRC"), "1");
  // The order records what it carried.
  EXPECT_EQ(v("GAPLCOM", "QTT", "0000000414"), "20");
  EXPECT_EQ(v("GAPLCOM", "QTT", "0000000413"), "10");
  EXPECT_EQ(v("GAPECOM", "QTT", "0000000402"), "30");
  EXPECT_EQ(v("GAPECOM", "QTNT", "0000000402"), "0");
  EXPECT_EQ(v("GAPECOM", "MTNT_HT", "0000000402"), "1200.00");
  EXPECT_EQ(v("GAPECOM", "DATE_MAJ", "0000000402"), Date::today().text());

  // The link document finds the receipt downstream of the order.
  Field type("T", "", "", 4, Kind::Entier, Valeur::entier(0), nullptr);
  Field ident("I", "", "", 4, Kind::Chaine, Valeur::chaine(""), nullptr);
  EvtParamRef chainage{val(-2), val("0000000402"), ref(type), ref(ident)};
  ASSERT_EQ(t_.session().appelerModule("QUARVO-EXISTE_CHAINAGE_AVAL", &chainage), 0);
  EXPECT_EQ(type.text() + " " + ident.text(), "-3 " + recu);

  // Nothing is left: a second transformation writes nothing.
  std::string avant = empreinte();
  EXPECT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000402")}), 1);
  EXPECT_EQ(run("GAPECOM-TRF", {val(-4), val("0000000402")}), 1);
  EXPECT_EQ(empreinte(), avant);
  EXPECT_EQ(t_.ui().transcriptText(), "");
}

TEST_F(DocumentsPiecesTest, OnlyAValidatedPieceBecomesAKindThatFollowsIt) {
  std::string avant = empreinte();
  EXPECT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000404")}), 1);  // not validated
  EXPECT_EQ(run("GAPECOM-TRF", {val(-2), val("0000000403")}), 1);  // an order from an order
  EXPECT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000999")}), 1);
  EXPECT_EQ(run("GAPEBL-TRF", {val(-3), val("0000000502")}), 1);
  EXPECT_EQ(run("GAPEFAC-TRF", {val(-4), val("0000000601")}), 1);
  EXPECT_EQ(empreinte(), avant);
  // An order may also go straight to an invoice.
  ASSERT_EQ(run("GAPECOM-TRF", {val(-4), val("0000000403")}), 0);
  EXPECT_EQ(v("GAPEFAC", "NUMERO_DOC", "0000001001"), "FF" + annee() + "000004");
  EXPECT_EQ(v("GAPEFAC", "TYPE", "0000001001"), "F");
  EXPECT_EQ(v("GAPEFAC", "SECAN_CODE", "0000001001"), "AFF001");
  EXPECT_EQ(v("GAPEFAC", "HT", "0000001001"), "3600.00");
  EXPECT_EQ(v("CHAINAGE", "TYPE_DST", "-2|0000000403|1", "CLE_SRC"), "-4");
}

TEST_F(DocumentsPiecesTest, ATransformationThatFailsHalfWayLeavesNothingBehind) {
  // The chaining row the transformation of CF26000003 would write exists already: it fails
  // after the receipt's header and line were made.
  t_.sql(R"(INSERT INTO "CHAINAGE" ("CLE_SRC", "TYPE_DST", "IDE_DST", "LIG_DST")
            VALUES ('-2|0000000403|1', -3, '0000001001', '1'))");
  std::string avant = empreinte();
  EXPECT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000403")}), 1);
  EXPECT_EQ(empreinte(), avant);
  // The generation was closed: the next transformation works.
  t_.sql(R"(DELETE FROM "CHAINAGE" WHERE "CLE_SRC" = '-2|0000000403|1')");
  EXPECT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000403")}), 0);
  EXPECT_EQ(v("GAPEBL", "NUMERO_DOC", "0000001001"), "BR" + annee() + "000003");
}

TEST_F(DocumentsPiecesTest, SettlingClosesWhatThePieceDidNotCarryAndLeavesNothingToCarry) {
  ASSERT_EQ(run("GAPECOM-SOLDER", {val("0000000402")}), 0);
  EXPECT_EQ(v("GAPLCOM", "QTE_SOLDEE", "0000000413"), "0");   // received whole
  EXPECT_EQ(v("GAPLCOM", "QTE_SOLDEE", "0000000414"), "20");  // never received
  EXPECT_EQ(v("GAPECOM", "QTNT", "0000000402"), "0");
  EXPECT_EQ(v("GAPECOM", "SOLDEE", "0000000402"), "1");
  EXPECT_EQ(v("GAPECOM", "MTNT_HT", "0000000402"), "950.00");  // what it carried
  EXPECT_EQ(run("GAPECOM-TRF", {val(-3), val("0000000402")}), 1);
  EXPECT_EQ(count("GAPEBL"), 2);

  EXPECT_EQ(run("GAPEBL-SOLDER", {val("0000000402")}), 1);  // not a receipt
  // A piece whose supplier is gone is not half-settled.
  t_.sql(R"(UPDATE "GAPECOM" SET "GCPFOUR_IDENT" = '0000000999' WHERE "IDENT" = '0000000403')");
  EXPECT_EQ(run("GAPECOM-SOLDER", {val("0000000403")}), 1);
  EXPECT_EQ(v("GAPLCOM", "QTE_SOLDEE", "0000000415"), "0");
  EXPECT_EQ(v("GAPECOM", "SOLDEE", "0000000403"), "0");
}

}  // namespace
}  // namespace quarvo::suite
