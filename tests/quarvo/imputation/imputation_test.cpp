// Pointing and imputation on the demo company: what the proposal holds, what the writer links,
// and what the budget lines show afterwards.
#include <gtest/gtest.h>

#include <sstream>

#include "app/FiguresCommand.h"
#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using namespace host;

class ImputationTest : public ::testing::Test {
 protected:
  ImputationTest() : t_(true) {}

  void point(const std::string& kind, int arbitration = 0, const std::string& min = "",
             const std::string& max = "", const std::string& project = "") {
    for (const char* work : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) t_.session().memoire(work).clear();
    EvtParamVal evt{val(""),  val("31/12/2026"), val(kind),   val(arbitration),
                    val(min), val(max),          val(project)};
    t_.session().appelerModule("QUARVO-POINTER_PIECES", &evt);
  }
  void write() { t_.session().appelerModule("QUARVO-IMPUTER_PIECES", nullptr); }
  // "PIECE:ERREUR" of each pointed piece, in key order.
  std::string pieces() {
    Table t(nullptr, "VOVOVA", "M_EAPPR", "T");
    t.ouvrir();
    std::string out;
    while (t.lire(1) == 0) {
      out += t.valeur("PIECE").toChaine() + ":" + t.valeur("ERREUR").toChaine() + " ";
    }
    return out;
  }
  // "AFLBUD_IDENT QTE HT" of the allocations of one piece line ("GAPLCOM|<NUMERO>").
  std::string allocations(const std::string& line) {
    auto bar = line.find('|');
    std::string table = line.substr(0, bar);
    std::string ident = t_.value(table, "IDENT", "NUMERO", line.substr(bar + 1));
    Table t(nullptr, "VOVOVA", "M_VAPPR", "T");
    t.chercher(3, "IDENT", '=', Valeur::chaine(table + "|" + ident));
    t.ouvrir();
    std::string out;
    while (t.lire(1) == 0) {
      out += t.valeur("AFLBUD_IDENT").toChaine() + " " + t.valeur("QTE").toChaine() + " " +
             t.valeur("HT").toChaine() + "; ";
    }
    return out;
  }
  std::string lineField(const std::string& key, const std::string& column) {
    Table t(nullptr, "VOVOVA", "M_LAPPR", "T");
    if (t.chercher(3, "NUMERO", '=', Valeur::chaine(key)) != 0) return "<none>";
    return t.valeur(column).toChaine();
  }
  // "AFLBUD_IDENT COMPOSANT PIECE QTE HT" of every link row.
  std::string links() {
    Table t(nullptr, "VOVOVA", "QUARVO", "T");
    t.ouvrir();
    std::string out;
    while (t.lire(1) == 0) {
      out += t.valeur("AFLBUD_IDENT").toChaine() + " " + t.valeur("PIECE").toChaine() + " " +
             t.valeur("QTE").toChaine() + " " + t.valeur("HT").toChaine() + "\n";
    }
    return out;
  }
  std::string veng(const std::string& line) { return t_.value("AFLBUD", "VENG", "IDENT", line); }
  int check() {
    std::ostringstream out;
    return app::runCheck(t_.session(), std::nullopt, false, out);
  }
  test::TestSession t_;
};

TEST_F(ImputationTest, SelectionByKindNumbersValidationAndPeriod) {
  point("B");
  EXPECT_EQ(pieces(), "BR26000001:0 BR26000002:0 ");
  t_.ui().clear();
  point("T");
  std::string shown = t_.ui().transcriptText();
  auto cf = shown.find("ATTENTE Traitement de la table GAPECOM");
  auto bl = shown.find("ATTENTE Traitement de la table GAPEBL");
  auto ff = shown.find("ATTENTE Traitement de la table GAPEFAC");
  EXPECT_TRUE(cf < bl && bl < ff) << shown;
  EXPECT_NE(shown.find("LIBELLE No bon de réception : BR26000002"), std::string::npos);
  EXPECT_EQ(pieces(),
            "BR26000001:0 BR26000002:0 CF26000001:0 CF26000002:0 CF26000003:0 CF26000004:0 "
            "FF26000001:0 FF26000002:0 AV26000001:0 FF26000003:0 ");
  point("C", 0, "CF26000002", "CF26000003");
  EXPECT_EQ(pieces(), "CF26000002:0 CF26000003:0 ");
  point("C", 0, "", "", "AFF002");
  EXPECT_EQ(pieces(), "CF26000002:0 ");

  // Unvalidated order 404 is pointed only when the company allows it; a piece dated after the
  // current month never is.
  t_.sql("UPDATE \"AFSOCI\" SET \"OPTION8\" = 'N'");
  t_.sql("UPDATE \"GAPECOM\" SET \"DATE_CREATION\" = '2027-01-04' WHERE \"IDENT\" = '0000000403'");
  EvtParamVal evt{val(""), val("31/01/2027"), val("C"), val(0)};
  for (const char* work : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) t_.session().memoire(work).clear();
  t_.session().appelerModule("QUARVO-POINTER_PIECES", &evt);
  EXPECT_EQ(pieces(), "CF26000001:0 CF26000002:0 ");
}

TEST_F(ImputationTest, UnitPricesQuantitiesAndCreditNotes) {
  point("T");
  // Carriage of 60.00 on an order of 1200.00: the 950.00 line bears 47.50, 4.75 per unit.
  EXPECT_EQ(lineField("GAPECOM|0000000402|1", "PUHT"), "99.75");
  EXPECT_EQ(lineField("GAPECOM|0000000402|1", "HT"), "997.50");
  EXPECT_EQ(lineField("GAPECOM|0000000402|2", "HT"), "262.50");
  // A credit note: negative quantity, negative amounts.
  EXPECT_EQ(lineField("GAPEFAC|0000000603|1", "QTE"), "-1");
  EXPECT_EQ(allocations("GAPLFAC|0000000603|1").substr(0, 22), "0000000211 -1 -315.00;");
  // Without gross amount on the header, no carriage is spread.
  t_.sql("UPDATE \"GAPECOM\" SET \"BRUT\" = '0.00' WHERE \"IDENT\" = '0000000402'");
  point("C");
  EXPECT_EQ(lineField("GAPECOM|0000000402|1", "PUHT"), "95.00");
}

TEST_F(ImputationTest, TwoSuitableLinesNeedArbitrationAndArbitrationCreatesMissingLines) {
  // A second line of budget 201 for the same service as line 211.
  t_.sql(
      "INSERT INTO \"AFLBUD\" (\"IDENT\", \"NUMERO\", \"AFEBUD_IDENT\", \"AFAFFA_IDENT\", "
      "\"AFPRES_IDENT\", \"VBUD_D\") SELECT '0000000219', '0000000201|9', '0000000201', "
      "\"AFAFFA_IDENT\", \"AFPRES_IDENT\", '100.00' FROM \"AFLBUD\" WHERE \"IDENT\" = "
      "'0000000211'");
  point("C", 0, "CF26000001", "CF26000001");
  EXPECT_EQ(pieces(), "CF26000001:1 ");
  EXPECT_EQ(allocations("GAPLCOM|0000000401|1"), "0000000211 4 720.00; 0000000219 0 0.00; ");
  EXPECT_EQ(lineField("GAPECOM|0000000401|1", "ERREUR"), "1");
  write();
  EXPECT_EQ(links(), "");  // a piece in error is not imputed
  point("C", 1, "CF26000001", "CF26000001");
  EXPECT_EQ(pieces(), "CF26000001:0 ");
  EXPECT_EQ(allocations("GAPLCOM|0000000401|1"), "0000000211 4 720.00; ");

  // Project AFF001's first budget has no line for the scaffolding service: arbitration makes one.
  t_.sql("UPDATE \"GAPLCOM\" SET \"SECAN_CODE\" = 'AFF001' WHERE \"NUMERO\" = '0000000404|1'");
  t_.sql(
      "DELETE FROM \"AFLBUD\" WHERE \"AFEBUD_IDENT\" = '0000000201' AND \"AFPRES_IDENT\" = "
      "(SELECT \"AFPRES_IDENT\" FROM \"AFLBUD\" WHERE \"IDENT\" = '0000000234')");
  point("C", 1, "CF26000004", "CF26000004");
  EXPECT_EQ(pieces(), "CF26000004:0 ");
  std::string created = allocations("GAPLCOM|0000000404|1").substr(0, 10);
  EXPECT_EQ(t_.value("AFLBUD", "NUMERO", "IDENT", created), "0000000201|");
  EXPECT_EQ(t_.value("AFLBUD", "APPRO", "IDENT", created), "A");
}

TEST_F(ImputationTest, WriterAddsLinesUpAndRerunsChangeNothing) {
  // The order's second line is fully settled: its allocation carries no quantity.
  t_.sql("UPDATE \"GAPLCOM\" SET \"QTE_SOLDEE\" = 2 WHERE \"NUMERO\" = '0000000401|2'");
  point("C", 1, "CF26000001", "CF26000002");
  write();
  EXPECT_EQ(links(),
            "0000000211 CF26000001 4 720.00\n"
            "0000000221 CF26000002 30 1260.00\n");  // two lines of one piece, one row
  EXPECT_EQ(veng("0000000211"), "720.00");
  EXPECT_EQ(veng("0000000221"), "1260.00");
  std::string before = links();
  point("C", 1, "CF26000001", "CF26000002");
  EXPECT_EQ(pieces(), "");  // unchanged since linked: skipped
  write();
  EXPECT_EQ(links(), before);
  EXPECT_EQ(check(), 0);

  // The order changes: its links are cancelled and it is pointed again.
  t_.sql("UPDATE \"GAPLCOM\" SET \"QTE_SOLDEE\" = 0 WHERE \"NUMERO\" = '0000000401|2'");
  t_.sql("UPDATE \"GAPECOM\" SET \"HEURE_MAJ\" = '18:00:00' WHERE \"IDENT\" = '0000000401'");
  point("C", 1, "CF26000001", "CF26000001");
  EXPECT_EQ(pieces(), "CF26000001:0 ");
  write();
  EXPECT_EQ(veng("0000000211"), "1350.00");
  EXPECT_EQ(check(), 0);
}

TEST_F(ImputationTest, AutomaticImputationTwiceLinksOnce) {
  ASSERT_EQ(t_.session().appelerModule("QUARVO-IMPUTER_AUTO", nullptr), 0);
  t_.session().executerEnAttente();
  std::string first = links();
  EXPECT_NE(first, "");
  EXPECT_EQ(check(), 0);
  ASSERT_EQ(t_.session().appelerModule("QUARVO-IMPUTER_AUTO", nullptr), 0);
  t_.session().executerEnAttente();
  EXPECT_EQ(links(), first);
  EXPECT_EQ(check(), 0);
  // Without a readable company nothing is pointed or written.
  t_.sql("DELETE FROM \"QUARVO\"");
  t_.sql("UPDATE \"AFSOCI\" SET \"CODE\" = 'AUTRE'");
  t_.session().appelerModule("QUARVO-IMPUTER_AUTO", nullptr);
  t_.session().executerEnAttente();
  EXPECT_EQ(links(), "");
}

}  // namespace
}  // namespace quarvo

namespace quarvo {
namespace {

TEST_F(ImputationTest, PieceRefusedByTheAnalysisHasEveryLineInError) {
  t_.sql("DELETE FROM \"GCPCPTACH\"");  // no purchase account any more
  point("C", 1, "CF26000001", "CF26000001");
  EXPECT_EQ(pieces(), "CF26000001:1 ");
  EXPECT_EQ(lineField("GAPECOM|0000000401|1", "ERREUR"), "1");
  EXPECT_EQ(lineField("GAPECOM|0000000401|2", "ERREUR"), "1");
  EXPECT_EQ(allocations("GAPLCOM|0000000401|1"), "");
  write();
  EXPECT_EQ(links(), "");
}

}  // namespace
}  // namespace quarvo
