// The interface's budget-line upkeep, rights checks and purges, on the demo company.
#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "host/table/Champ.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using namespace host;

const char* kLine = "0000000211";  // budget line of project AFF001, budgeted 6000.00

class InterfaceTest : public ::testing::Test {
 protected:
  InterfaceTest() : t_(true) {}

  void link(const std::string& ident, const std::string& line, const std::string& kind,
            const std::string& piece, const std::string& number, double qte, double qtt,
            const std::string& ht, const std::string& project = "0000000011") {
    t_.sql(
        "INSERT INTO \"QUARVO\" (\"IDENT\", \"AFEBUD_IDENT\", \"AFAFFA_IDENT\", \"AFLBUD_IDENT\", "
        "\"COMPOSANT\", \"COMPOSANT_IDENT\", \"PIECE\", \"DATE_PIECE\", \"QTE\", \"QTT\", \"HT\") "
        "VALUES ('" +
        ident + "', '0000000201', '" + project + "', '" + line + "', '" + kind + "', '" + piece +
        "', '" + number + "', '2026-05-12', " + std::to_string(qte) + ", " + std::to_string(qtt) +
        ", '" + ht + "')");
  }
  // A line mixing every kind of link.
  void mixedLinks() {
    link("0000005001", kLine, "GAPECOM", "0000000401", "CF26000001", 10, 6, "1500.00");
    link("0000005002", kLine, "GAPEBL", "0000000501", "BR26000001", 3, 1, "100.00");  // 2/3 left
    link("0000005003", kLine, "GAPEFAC", "0000000601", "FF26000001", 4, 0, "1620.00");
    link("0000005004", kLine, "GAPEFAC", "0000000603", "AV26000001", -1, 0, "-270.00");
    link("0000005005", kLine, "AFEFFO", "0000000701", "TPS0001", 7, 0, "315.50");
    link("0000005006", kLine, "GAPEBL", "0000000502", "BR26000002", 0, 0, "80.00");  // no quantity
  }
  int call(const std::string& label, std::vector<Arg> args) {
    EvtParamVal evt(std::move(args));
    return t_.session().appelerProcedure("QUARVO", label, &evt);
  }
  // VENG | VREA | VRAF | HRAF | AVT of a budget line, as stored.
  std::string figures(const std::string& line = kLine) {
    Table t(nullptr, "VOVOVA", "AFLBUD", "TEST");
    t.chercher(3, "IDENT", '=', Valeur::chaine(line));
    return t.valeur("VENG").toChaine() + " | " + t.valeur("VREA").toChaine() + " | " +
           t.valeur("VRAF").toChaine() + " | " + t.valeur("HRAF").toChaine() + " | " +
           t.valeur("AVT").toChaine();
  }
  int64_t count(const std::string& table, const std::string& where) {
    Table t(nullptr, "VOVOVA", table, "COUNT");
    auto eq = where.find('=');
    if (eq != std::string::npos)
      t.ajouterCritere(where.substr(0, eq), '=', Valeur::chaine(where.substr(eq + 1)));
    return t.compter();
  }
  test::TestSession t_;
};

TEST_F(InterfaceTest, ValidationAddsEveryKindOfLinkAndThePairLeavesFiguresUnchanged) {
  mixedLinks();
  ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine)}), 0);
  // Committed: the order. Realised: 2/3 of the receipt still to invoice (66.67), the invoice,
  // the credit note and the time entry; the receipt without quantity adds nothing.
  std::string after = figures();
  EXPECT_EQ(after, "1500.00 | 1732.17;1732.17;1732.17 | 4267.83;4267.83;4267.83 | 0 | 28.8695");
  EXPECT_EQ(t_.value("AFRESU", "VENG", "AFAFFA_IDENT", "0000000011"), "1500.00");
  EXPECT_EQ(count("AFMOUV", "ETAT=G"), 4);  // receipt with a share, invoice, credit note, time
  for (const char* option9 : {"O", "N"}) {
    t_.sql(std::string("UPDATE \"AFSOCI\" SET \"OPTION9\" = '") + option9 + "'");
    ASSERT_EQ(call("SUPPRESSION_MAJ", {val(kLine)}), 0);
    ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine)}), 0);
    EXPECT_EQ(figures(), after) << "OPTION9 " << option9;
  }
  t_.sql("UPDATE \"AFSOCI\" SET \"OPTION9\" = 'O'");
  ASSERT_EQ(call("SUPPRESSION_MAJ", {val(kLine)}), 0);
  EXPECT_EQ(figures(), "0.00 | 0.00;0.00;0.00 | 6000.00;6000.00;6000.00 | 0 | 0");
  EXPECT_EQ(t_.value("AFRESU", "VENG", "AFAFFA_IDENT", "0000000011"), "0.00");
  EXPECT_EQ(count("AFMOUV", ""), 0);

  // A company that does not book goods received: the receipt's 66.67 stays out, and it gets no
  // movement.
  t_.sql("UPDATE \"AFSOCI\" SET \"OPTION9\" = 'N'");
  ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine)}), 0);
  EXPECT_EQ(figures().substr(0, 35), "1500.00 | 1665.50;1665.50;1665.50 |");
  EXPECT_EQ(count("AFMOUV", "COMPOSANT=GAPEBL"), 0);
}

TEST_F(InterfaceTest, RemainingFiguresAndProgressFollowTheBudget) {
  // Realised beyond the budget: nothing remains, progress stops at 100.
  link("0000005001", kLine, "GAPEFAC", "0000000601", "FF26000001", 1, 0, "7250.00");
  ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine)}), 0);
  EXPECT_EQ(figures(), "0.00 | 7250.00;7250.00;7250.00 | 0.00;0.00;0.00 | 0 | 100");

  // A line without any budget: no remaining amount and no progress.
  t_.sql(
      "UPDATE \"AFLBUD\" SET \"VBUD_D\" = '0.00', \"HBUD\" = 0, \"VRAF\" = '5.00;5.00;5.00', "
      "\"HRAF\" = 3 WHERE \"IDENT\" = '0000000212'");
  link("0000005002", "0000000212", "GAPEFAC", "0000000601", "FF26000001", 1, 0, "10.00");
  ASSERT_EQ(call("VALIDATION_MAJ", {val("0000000212")}), 0);
  EXPECT_EQ(figures("0000000212"), "0.00 | 10.00;10.00;10.00 | 0.00;0.00;0.00 | 0 | 0");

  // A lone credit note: realised below zero, more remains than was budgeted; progress stays 0.
  link("0000005004", "0000000214", "GAPEFAC", "0000000603", "AV26000001", -1, 0, "-100.00");
  ASSERT_EQ(call("VALIDATION_MAJ", {val("0000000214")}), 0);
  EXPECT_EQ(figures("0000000214"),
            "0.00 | -100.00;-100.00;-100.00 | 1900.00;1900.00;1900.00 | 0 | 0");

  // A line whose remaining figures are kept by hand ("AFFECTE" O) keeps them.
  t_.sql(
      "UPDATE \"AFLBUD\" SET \"AFFECTE\" = 'O', \"VRAF\" = '999.00;998.00;997.00', \"HRAF\" = 4 "
      "WHERE \"IDENT\" = '0000000213'");
  link("0000005003", "0000000213", "GAPECOM", "0000000401", "CF26000001", 1, 0, "50.00");
  ASSERT_EQ(call("VALIDATION_MAJ", {val("0000000213")}), 0);
  std::string kept = figures("0000000213");
  EXPECT_EQ(kept.substr(0, 49), "50.00 | 0.00;0.00;0.00 | 999.00;998.00;997.00 | 4");
}

TEST_F(InterfaceTest, OnePieceOnlyAndDeletedInvoicesCountWithoutMovement) {
  mixedLinks();
  ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine), val("GAPECOM"), val("0000000401")}), 0);
  EXPECT_EQ(figures().substr(0, 34), "1500.00 | 0.00;0.00;0.00 | 6000.00");
  // Invoice FF26000001 deleted in its module: still realised, but no movement is made for it.
  t_.sql("DELETE FROM \"GAPEFAC\" WHERE \"NUMERO_DOC\" = 'FF26000001'");
  ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine), val("GAPEFAC"), val("0000000601")}), 0);
  EXPECT_EQ(figures().substr(0, 35), "1500.00 | 1620.00;1620.00;1620.00 |");
  EXPECT_EQ(count("AFMOUV", "COMPOSANT_IDENT=0000000601"), 0);
  // An unknown budget line changes nothing and fails.
  EXPECT_EQ(call("VALIDATION_MAJ", {val("0000009999")}), 1);
}

TEST_F(InterfaceTest, DeletedPieceLeavesNoLinkAndNoAmountBehind) {
  mixedLinks();
  link("0000005007", "0000000212", "GAPECOM", "0000000401", "CF26000001", 2, 0, "300.00");
  ASSERT_EQ(call("VALIDATION_MAJ", {val(kLine)}), 0);
  ASSERT_EQ(call("VALIDATION_MAJ", {val("0000000212")}), 0);
  ASSERT_EQ(call("SUPPRIMER_PIECE", {val("GAPECOM"), val("0000000401")}), 0);
  EXPECT_EQ(count("QUARVO", "COMPOSANT_IDENT=0000000401"), 0);
  EXPECT_EQ(figures().substr(0, 4), "0.00");
  EXPECT_EQ(figures("0000000212").substr(0, 4), "0.00");
  EXPECT_EQ(count("QUARVO", ""), 5);

  t_.sql(
      "INSERT INTO \"AFPFST\" (\"IDENT\", \"QUARVO_IDENT\") VALUES ('0000000001', '0000005005')");
  ASSERT_EQ(call("PURGER_AFEBUD", {val("0000000201"), val("CLOEXE")}), 0);
  EXPECT_EQ(count("QUARVO", ""), 0);
  EXPECT_EQ(count("AFPFST", ""), 0);
  EXPECT_EQ(count("AFMOUV", ""), 0);
  link("0000005008", kLine, "GAPECOM", "0000000401", "CF26000001", 2, 0, "300.00", "0000000012");
  ASSERT_EQ(call("PURGER_AFAFFA", {val("0000000012")}), 0);
  EXPECT_EQ(count("QUARVO", ""), 0);
}

TEST_F(InterfaceTest, LectureLeavesTheLinkRowInItsInterfaceRecord) {
  mixedLinks();
  EXPECT_EQ(call("LECTURE", {val("0000005003")}), 0);
  Table record(nullptr, "VOVOVA", "I_QUARVO", "");
  EXPECT_EQ(record.valeur("PIECE").toChaine(), "FF26000001");
  EXPECT_EQ(record.valeur("CLE_COMPO").toChaine(), std::string(kLine) + "|GAPEFAC|FF26000001");
  EXPECT_EQ(call("LECTURE", {val("0000009999")}), 1);
  EXPECT_EQ(record.valeur("PIECE").toChaine(), "");
}

TEST_F(InterfaceTest, RightsAndFolderChecksBeforeAnythingOpens) {
  EXPECT_EQ(call("VERIF_DROITS", {val("C")}), 0);
  EXPECT_EQ(call("VERIF_DROITS", {}), 0);  // "I" by default
  EXPECT_EQ(call("VERIF_DROITS", {val("Z")}), 1);
  EXPECT_NE(t_.ui().transcriptText().find("[38]"), std::string::npos);
  t_.ui().clear();
  // The checks pass and the screen is launched.
  EXPECT_EQ(call("IMPUTER", {}), 0);
  EXPECT_EQ(t_.ui().transcriptText().find("INCIDENT"), std::string::npos);
  t_.ui().clear();
  t_.sql("DELETE FROM \"SYSCOMPO\"");
  EXPECT_EQ(call("IMPORTER", {}), 1);
  EXPECT_NE(t_.ui().transcriptText().find("[15] Le module QUARVO_IMPORTER"), std::string::npos);
  t_.ui().clear();
  t_.sql("UPDATE \"AFSOCI\" SET \"MOIS_ANNEE\" = ''");
  EXPECT_EQ(call("ANNULER", {}), 1);  // unusable folder: nothing opens, nothing is said
  EXPECT_EQ(t_.ui().transcriptText(), "");
}

TEST_F(InterfaceTest, RightsOfAReadOnlyUserNarrowTheLinkDocumentModes) {
  ScriptedDriver ui;
  Session reader(t_.db(), ui, "DEMO", "lecteur");
  reader.setDataDir(t_.session().dataDir());
  Session::Scope scope(reader);
  EvtParamVal noRight{val("C")};
  EXPECT_EQ(reader.appelerProcedure("QUARVO", "VERIF_DROITS", &noRight), 1);
  EvtParamVal manage{val("0000000201"), val(kLine), val("MC")};  // no "V" asked, none granted
  EXPECT_EQ(reader.appelerProcedure("QUARVO", "GESTION", &manage), 1);
  EXPECT_NE(ui.transcriptText().find("[37]"), std::string::npos);
  EXPECT_NE(ui.transcriptText().find("GESTION"), std::string::npos) << ui.transcriptText();
  ScriptedDriver strangerUi;
  Session stranger(t_.db(), strangerUi, "DEMO", "nobody");
  stranger.setDataDir(t_.session().dataDir());
  Session::Scope scope2(stranger);
  EvtParamVal any{val("I")};
  EXPECT_EQ(stranger.appelerProcedure("QUARVO", "VERIF_DROITS", &any), 1);
  EXPECT_NE(strangerUi.transcriptText().find("[36]"), std::string::npos);
}

}  // namespace
}  // namespace quarvo
