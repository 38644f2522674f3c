// The choice of a project's pieces and time entries, the rights on transforming a piece, and the
// walk over a piece's lines, as the link document calls them, on the demo company.
#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "support/TestSession.h"

namespace quarvo::suite {
namespace {

using namespace host;

// A scripted driver that also keeps the items of the last choice list it was shown.
class Enregistreur : public ScriptedDriver {
 public:
  std::optional<int> choisir(const std::string& title,
                             const std::vector<std::string>& items) override {
    offerts = items;
    return ScriptedDriver::choisir(title, items);
  }
  std::vector<std::string> offerts;
};

class ChoixPiecesTest : public ::testing::Test {
 protected:
  ChoixPiecesTest() : precedent_(t_.session().remplacerUi(ui_)) {}
  ~ChoixPiecesTest() override { t_.session().remplacerUi(precedent_); }

  int call(const std::string& module, const std::string& label, std::vector<Arg> args) {
    EvtParamRef evt(std::move(args));
    return t_.session().appelerProcedure(module, label, &evt);
  }
  // Remembers `projet` for `module`, then runs its choice with `reponse` queued (none when
  // empty); "<outcome> <parameter 0>".
  std::string choisir(const std::string& module, const std::string& projet,
                      const std::string& reponse, const std::string& label = "CHOISIR") {
    EXPECT_EQ(call(module, "AFFECTE_PARAMETRES", {val(""), val(projet)}), 0);
    if (!reponse.empty()) ui_.repondre(reponse);
    Field piece("P", "", "", 4, Kind::Chaine, Valeur::chaine("avant"), nullptr);
    int rc = call(module, label, {ref(piece)});
    return std::to_string(rc) + " " + piece.text();
  }
  std::string record(const std::string& table) {
    MemoryStore& r = t_.session().memoire("I_" + table);
    auto i = r.schema().index("IDENT");
    return r.size() == 0 || !i ? "<vide>" : r.firstRow().values[*i].toChaine();
  }

  test::TestSession t_{true};
  Enregistreur ui_;
  UiDriver& precedent_;
};

TEST_F(ChoixPiecesTest, TheProjectsPiecesAreOfferedInNumberOrderAndTheChosenOneComesBack) {
  EXPECT_EQ(choisir("GAPECOM", "AFF001", "2"), "0 0000000403");
  EXPECT_EQ(ui_.transcriptText(), "CHOIX Commandes fournisseur de l'affaire AFF001 (2) -> 2\n");
  EXPECT_EQ(ui_.offerts,
            (std::vector<std::string>{"CF26000001  02/03/2026  Câblage des salles de classe",
                                      "CF26000003  05/05/2026  Reprise des murets de la cour"}));
  // Invoices of the same project, by their own module: in number order, the credit note first
  // though it was entered after the invoices.
  EXPECT_EQ(choisir("GAPEFAC", "AFF001", "1"), "0 0000000603");
  ASSERT_EQ(ui_.offerts.size(), 3u);
  EXPECT_EQ(ui_.offerts[0].substr(0, 10), "AV26000001");
}

TEST_F(ChoixPiecesTest, AHeadersSectionWinsAndOnlyAHeaderWithoutOneGoesByItsLines) {
  // CF26000002 has no section of its own; its lines are on AFF002.
  EXPECT_EQ(choisir("GAPECOM", "AFF002", "1"), "0 0000000402");
  EXPECT_EQ(ui_.offerts.size(), 1u);
  // A line of an AFF001 order on AFF002 does not bring its order.
  t_.sql(R"(UPDATE "GAPLCOM" SET "SECAN_CODE" = 'AFF002' WHERE "IDENT" = '0000000411')");
  EXPECT_EQ(choisir("GAPECOM", "AFF002", "1"), "0 0000000402");
  EXPECT_EQ(ui_.offerts.size(), 1u);
  // Once its header has no section, it does.
  t_.sql(R"(UPDATE "GAPECOM" SET "SECAN_CODE" = '' WHERE "IDENT" = '0000000401')");
  EXPECT_EQ(choisir("GAPECOM", "AFF002", "1"), "0 0000000401");
  EXPECT_EQ(ui_.offerts.size(), 2u);
  // Receipts follow the same rule: BR26000002 by its line.
  EXPECT_EQ(choisir("GAPEBL", "AFF002", "1"), "0 0000000502");
}

TEST_F(ChoixPiecesTest, NothingChosenOrNothingToOfferFailsAndKeepsTheParameter) {
  EXPECT_EQ(choisir("GAPECOM", "AFF001", ""), "1 avant");  // the person chose nothing
  EXPECT_EQ(ui_.transcriptText(), "CHOIX Commandes fournisseur de l'affaire AFF001 (2) -> \n");
  ui_.clear();
  EXPECT_EQ(choisir("GAPECOM", "AFF001", "7"), "1 avant");  // not an item
  ui_.clear();
  // No piece on the project, or no project: nobody is asked.
  EXPECT_EQ(choisir("GAPEBL", "AFF003", "1"), "1 avant");
  EXPECT_EQ(choisir("GAPECOM", "", "1"), "1 avant");
  EXPECT_EQ(ui_.transcriptText(), "");
}

TEST_F(ChoixPiecesTest, EachModuleRemembersItsOwnProject) {
  ASSERT_EQ(call("GAPECOM", "AFFECTE_PARAMETRES", {val(""), val("AFF003")}), 0);
  ASSERT_EQ(call("GAPEBL", "AFFECTE_PARAMETRES", {val(""), val("AFF001")}), 0);
  ui_.repondre("1");
  Field piece("P", "", "", 4, Kind::Chaine, Valeur::chaine(""), nullptr);
  ASSERT_EQ(call("GAPECOM", "CHOISIR", {ref(piece)}), 0);
  EXPECT_EQ(piece.text(), "0000000404");  // AFF003's order, not AFF001's
}

TEST_F(ChoixPiecesTest, TimeEntriesAreOfferedByTheirLinesProjectAndReadAsBefore) {
  EXPECT_EQ(choisir("AFEFFO", "AFF002", "1", "CHOIX"), "0 0000000701");
  EXPECT_EQ(ui_.transcriptText(), "CHOIX Relevés d'heures de l'affaire AFF002 (1) -> 1\n");
  EXPECT_EQ(
      ui_.offerts,
      (std::vector<std::string>{"TE26000001  15/06/2026  Relevé d'heures de juin — Lucie Bérard"}));
  EXPECT_EQ(choisir("AFEFFO", "AFF003", "1", "CHOIX"), "1 avant");
  EXPECT_EQ(choisir("AFEFFO", "AFF999", "1", "CHOIX"), "1 avant");  // no such project
  // The generic reads are still the module's.
  EXPECT_EQ(call("AFEFFO", "LECTURE_NUMERO_DOC", {val("TE26000001")}), 0);
  EXPECT_EQ(record("AFEFFO"), "0000000701");
  EXPECT_EQ(call("AFEFFO", "LECTURE", {val("0000000999")}), 1);
}

TEST_F(ChoixPiecesTest, TransformationRightsAreTheUsersInTheModulesApplicationOrElseTheSuites) {
  auto droits = [this](const std::string& module, const std::string& piece) {
    Field modes("M", "", "", 4, Kind::Chaine, Valeur::chaine("MC"), nullptr);
    int rc = call(module, "DROIT_TRANSFORMATION_DOC", {val(piece), ref(modes)});
    return std::to_string(rc) + " " + modes.text();
  };
  EXPECT_EQ(droits("GAPECOM", "0000000401"), "0 MC");  // "VCAIMS" in the project application
  t_.sql(R"(UPDATE "SYSDROIT" SET "DROITS" = 'VI' WHERE "UTILISATEUR" = 'demo')");
  EXPECT_EQ(droits("GAPECOM", "0000000401"), "0 ");
  // Rights of their own for the orders; the receipts still have the suite's.
  t_.sql(R"(INSERT INTO "SYSAPPLI" ("IDENT", "CODE") VALUES ('0000000900', 'GAPECOM');
            INSERT INTO "SYSDROIT" ("IDENT", "SYSAPPLI_IDENT", "UTILISATEUR", "DROITS")
            VALUES ('0000000901', '0000000900', 'demo', 'VM'))");
  EXPECT_EQ(droits("GAPECOM", "0000000401"), "0 M");
  EXPECT_EQ(droits("GAPEBL", "0000000501"), "0 ");
  t_.sql(R"(DELETE FROM "SYSDROIT" WHERE "UTILISATEUR" = 'demo')");
  EXPECT_EQ(droits("GAPECOM", "0000000401"), "0 ");
  // A piece the module does not have.
  EXPECT_EQ(droits("GAPECOM", "0000000501"), "1 MC");
}

TEST_F(ChoixPiecesTest, ALineWalkReadsOnePiecesLinesInKeyOrderAndSurvivesBetweenCalls) {
  EXPECT_EQ(call("GAPLCOM", "LECTURE_SUIVANT", {}), 1);  // no walk started
  ASSERT_EQ(call("GAPLCOM", "POSDEBUT", {val("0000000401")}), 0);
  ASSERT_EQ(call("GAPLBL", "POSDEBUT", {val("0000000502")}), 0);  // a walk of another module
  std::string lus;
  while (call("GAPLCOM", "LECTURE_SUIVANT", {}) == 0) {
    lus += record("GAPLCOM") + " ";
    if (call("GAPLBL", "LECTURE_SUIVANT", {}) == 0) lus += "(" + record("GAPLBL") + ") ";
  }
  EXPECT_EQ(lus, "0000000411 (0000000513) 0000000412 ");
  EXPECT_EQ(record("GAPLCOM"), "<vide>");  // past the last line the record is empty
  EXPECT_EQ(call("GAPLCOM", "LECTURE_SUIVANT", {}), 1);
  // Started again, the walk begins again; a piece without lines has nothing to read.
  ASSERT_EQ(call("GAPLCOM", "POSDEBUT", {val("0000000401")}), 0);
  EXPECT_EQ(call("GAPLCOM", "LECTURE_SUIVANT", {}), 0);
  EXPECT_EQ(record("GAPLCOM"), "0000000411");
  ASSERT_EQ(call("GAPLFAC", "POSDEBUT", {val("0000000999")}), 0);
  EXPECT_EQ(call("GAPLFAC", "LECTURE_SUIVANT", {}), 1);
}

}  // namespace
}  // namespace quarvo::suite
