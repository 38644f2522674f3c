#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <functional>
#include <set>

#include "host/session/Session.h"
#include "host/table/SqliteDatabase.h"
#include "host/ui/Ecran.h"
#include "host/ui/ScriptedDriver.h"
#include "quarvo/report/ReportFixture.h"

namespace quarvo {
namespace {

using host::Automate;
using test::ReportFixture;

bool contient(const std::string& text, const std::string& part) {
  return text.find(part) != std::string::npos;
}

TEST(Seletat1Test, BuildsOneRowPerBudgetLineAndPerLinkedPiece) {
  ReportFixture f;
  auto file = f.t().dir() / "suivi.txt";
  Automate& w = f.preparer(file.string());
  EXPECT_EQ(f.lever(w, "VALID"), 0);
  std::string rows = f.lignes();
  // The line's own row opens it, with its budget and the budget's date.
  EXPECT_TRUE(contient(
      rows, "0000000213|0| | Prestation | Sous-traitance maçonnerie | 9000.00 0.00 0.00 0.00\n"));
  // One order linked twice to one budget line: one row holding both amounts.
  EXPECT_TRUE(contient(rows,
                       "0000000213|2|CF26000003 | BC CF26000003 | Reprise des murets de la cour | "
                       "0.00 3600.00 0.00 0.00\n"));
  // Pieces before the period gathered in one row per line, by kind.
  EXPECT_TRUE(
      contient(rows, "0000000211|1| |  | AVANT 01/04/2026 | 0.00 1350.00 1350.00 1350.00\n"));
  EXPECT_TRUE(contient(rows,
                       "0000000211|4|AV26000001 | A AV26000001 | Retour d'un tableau électrique | "
                       "0.00 0.00 0.00 -315.00\n"));
  EXPECT_FALSE(contient(rows, "CF26000001"));
  // An invoice of another type gets no piece text; a time entry is an "F " row of its own.
  EXPECT_TRUE(contient(
      rows, "0000000215|4|XX26000009 |  | Facture d'un autre type | 0.00 0.00 0.00 50.00\n"));
  EXPECT_TRUE(
      contient(rows, "0000000215|5|TE26000001 | F TE26000001 |  | 0.00 0.00 0.00 280.00\n"));
  // A title line (STYLE 1) and the piece linked to it produce nothing.
  EXPECT_FALSE(contient(rows, "0000000231"));
  EXPECT_TRUE(contient(rows, "0000000232|0|"));
  // The walk went through the event loop with the gauge, and the export file is remembered.
  EXPECT_EQ(f.t().ui().transcriptText(),
            "ATTENTE Sélection en cours\nJAUGE 0/1\nJAUGE 3/3\nFIN ATTENTE\n");
  EXPECT_TRUE(std::filesystem::exists(file));
  host::Table pref(nullptr, "$$", "ACTPREF", "TEST");
  ASSERT_EQ(pref.chercher(3, "AUTOMATE", '=', host::Valeur::chaine("QUARVO-IMPETAT1")), 0);
  EXPECT_EQ(pref.valeur("VALEUR").toChaine(), file.string());
  EXPECT_EQ(pref.valeur("UTILISATEUR").toChaine(), "demo");
  // A second validation starts afresh: the same rows, not doubled amounts.
  EXPECT_EQ(f.lever(w, "VALID"), 0);
  EXPECT_EQ(f.lignes(), rows);
  // The next screen opens on the remembered file, with the company's current month.
  Automate& again = f.ouvrir();
  EXPECT_EQ(again.champ("VFICHIER")->text(), file.string());
  EXPECT_EQ(again.champ("VDATEMIN")->text(), "01/12/2026");
  EXPECT_EQ(again.champ("VDATEMAX")->text(), "31/12/2026");
  EXPECT_EQ(again.champ("VPERIO_ANT")->text(), "1");
}

TEST(Seletat1Test, PiecesBeforeThePeriodAreLeftOutWithoutVperioAnt) {
  ReportFixture f;
  Automate& w = f.preparer((f.t().dir() / "suivi.txt").string());
  ReportFixture::poser(w, "VPERIO_ANT", "0");
  // A piece dated on the first day of the period belongs to the period.
  f.t().sql(R"(UPDATE "QUARVO" SET "DATE_PIECE" = '2026-04-01' WHERE "IDENT" = 'L05')");
  f.lever(w, "VALID");
  std::string rows = f.lignes();
  EXPECT_FALSE(contient(rows, "AVANT"));
  EXPECT_FALSE(contient(rows, "|1|"));
  EXPECT_TRUE(contient(rows, "0000000211|0|"));
  EXPECT_TRUE(contient(rows, "0000000211|4|AV26000001"));
}

TEST(Seletat1Test, RefusesAnEmptyReportAndAPeriodPastTheFiscalYear) {
  ReportFixture f;
  auto file = f.t().dir() / "suivi.txt";
  Automate& w = f.preparer(file.string());
  // Option rules: the pieces need the lines and the page per project, and back.
  ReportFixture::poser(w, "VFOLIO", "0");
  f.lever(w, "VFOLIO");
  EXPECT_EQ(w.champ("VCORPS")->text() + w.champ("VCORPS2")->text(), "00");
  ReportFixture::poser(w, "VCORPS2", "1");
  f.lever(w, "VCORPS2");
  EXPECT_EQ(w.champ("VFOLIO")->text() + w.champ("VCORPS")->text(), "11");
  // The recapitulations need a grouping criterion.
  EXPECT_FALSE(w.ecran().controle("VRECAP1").actif);
  ReportFixture::poser(w, "VCLASSEMENT", "AFCLIE");
  f.lever(w, "VCLASSEMENT_LIB_FERME");
  EXPECT_TRUE(w.ecran().controle("VRECAP1").actif);
  EXPECT_EQ(w.champ("VCLASSEMENT_LIB")->text(), "Client");
  ReportFixture::poser(w, "VCLASSEMENT", "");
  ReportFixture::poser(w, "VRECAP1", "1");
  f.lever(w, "VCLASSEMENT_LIB_FERME");
  EXPECT_EQ(w.champ("VRECAP1")->text(), "0");
  EXPECT_FALSE(w.ecran().controle("VRECAP2").actif);

  ReportFixture::poser(w, "VFOLIO", "0");
  f.lever(w, "VFOLIO");
  f.t().ui().clear();
  EXPECT_EQ(f.lever(w, "VALID"), 1);
  EXPECT_EQ(f.t().ui().transcriptText(),
            "MESSAGE Information | [99] Choisissez au moins une partie à imprimer : le détail par "
            "affaire ou l'un des récapitulatifs. | [OK]\n");
  EXPECT_EQ(w.ecran().focus(), "VFOLIO");
  EXPECT_EQ(f.lignes(), "");

  ReportFixture::poser(w, "VFOLIO", "1");
  ReportFixture::poser(w, "VDATEMAX", "15/01/2027");
  f.t().ui().clear();
  EXPECT_EQ(f.lever(w, "VALID"), 1);
  EXPECT_EQ(f.t().ui().transcriptText(),
            "MESSAGE Information | [100] La date de fin de période dépasse la fin de l'exercice "
            "en cours (31/12/2026). | [OK]\n");
  EXPECT_EQ(f.lignes(), "");
  EXPECT_FALSE(std::filesystem::exists(file));

  ReportFixture::poser(w, "VDATEMAX", "31/12/2026");
  ReportFixture::poser(w, "VAFFA_CHOIX", "A");
  f.t().ui().clear();
  EXPECT_EQ(f.lever(w, "VALID"), 1);
  EXPECT_TRUE(contient(f.t().ui().transcriptText(), "[438]"));
}

TEST(Seletat1Test, ProjectsFollowRangesRightsCriterionAndBudgetOptions) {
  ReportFixture f;
  Automate& w = f.preparer((f.t().dir() / "suivi.txt").string());
  auto budgets = [&f]() {
    host::Table m(nullptr, "VOVOVA", "M_APPR1", "TEST");
    m.ouvrir();
    std::set<std::string> seen;
    while (m.lire(1) == 0) {
      seen.insert(m.valeur("AFAFFA_CODE").toChaine() + "/" + m.valeur("AFEBUD_PIECE").toChaine() +
                  "/" + m.valeur("CRITERE").toChaine() + "/" +
                  m.valeur("CRITERE_DESIG").toChaine());
    }
    std::string out;
    for (const auto& s : seen) out += s + " ";
    return out;
  };
  ReportFixture::poser(w, "VCLASSEMENT", "AFRPS1");
  ReportFixture::poser(w, "VCLI", "CLI001");
  f.lever(w, "VALID");
  EXPECT_EQ(
      budgets(),
      "AFF001/BU25-0007/CDUPRE/Dupré AFF001/BU26-0001/CDUPRE/Dupré AFF003/BU26-0003/MLEROY/Leroy ");

  ReportFixture::poser(w, "VCLI", "");
  ReportFixture::poser(w, "VCLASSEMENT", "AFCRI1");
  ReportFixture::poser(w, "VETAT", "NC");
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(),
            "AFF001/BU26-0001/PUBLIC/Marchés publics AFF002/MANUEL/PUBLIC/Marchés publics "
            "AFF003/BU26-0003/PUBLIC/Marchés publics ");

  ReportFixture::poser(w, "VCLASSEMENT", "");
  ReportFixture::poser(w, "VETAT", "C");
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(), "AFF001/BU25-0007// ");
  ReportFixture::poser(w, "VCLOS2", "O");  // closed before the current fiscal year
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(), "");

  ReportFixture::poser(w, "VETAT", "T");
  ReportFixture::poser(w, "VTYPE_OPT", "U");
  ReportFixture::poser(w, "VTYPE_CHOIX", "R");
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(), "AFF003/BU26-0003// ");

  // One project by code; a user restricted to the design department sees only its projects.
  ReportFixture::poser(w, "VTYPE_OPT", "T");
  ReportFixture::poser(w, "VAFFA_CHOIX", "A");
  ReportFixture::poser(w, "VAFFA_CODE", "AFF002");
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(), "AFF002/MANUEL// ");
  f.t().sql(R"(INSERT INTO "AFDROI" ("IDENT","UTILISATEUR","AFETAB_CODE","AFSERV_CODE")
               VALUES ('0000009001','demo','','ETU'))");
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(), "");
  ReportFixture::poser(w, "VAFFA_CHOIX", "T");
  f.lever(w, "VALID");
  EXPECT_EQ(budgets(), "AFF003/BU26-0003// ");
}

// A driver that runs `pendant` when the gauge first shows: the selection has begun reading.
// The outputs of one command (a text, then a workbook, then the pages) come from one selection:
// validating the same selection again with nothing written since makes only the output. A
// write by anyone, or another selection, builds the table again.
TEST(Seletat1Test, OneSelectionGivesEveryOutputUntilSomethingIsWritten) {
  ReportFixture f;
  Automate& w = f.preparer((f.t().dir() / "suivi.txt").string());
  auto selectionne = [&](const std::string& fichier) {
    f.t().ui().clear();
    ReportFixture::poser(w, "VFICHIER", (f.t().dir() / fichier).string());
    EXPECT_EQ(f.lever(w, "VALID"), 0);
    EXPECT_TRUE(std::filesystem::exists(f.t().dir() / fichier)) << fichier;
    return contient(f.t().ui().transcriptText(), "ATTENTE Sélection en cours");
  };
  EXPECT_TRUE(selectionne("suivi.txt"));
  const std::string table = f.lignes();
  EXPECT_FALSE(selectionne("suivi.xlsx"));
  EXPECT_EQ(f.lignes(), table);

  // Another program changes an amount: the next output is built from the file again.
  host::SqliteDatabase ecrivain(f.t().dir() / "test.db", false);
  ecrivain.execScript(R"(UPDATE "QUARVO" SET "HT" = '2000.00' WHERE "IDENT" = 'L06')");
  EXPECT_TRUE(selectionne("apres.txt"));
  EXPECT_TRUE(contient(f.lignes(), "CF26000003 | Reprise des murets de la cour | 0.00 2600.00"))
      << f.lignes();
  EXPECT_FALSE(selectionne("encore.txt"));

  // This session writes, or the selection changes: built again too.
  f.t().sql(R"(UPDATE "QUARVO" SET "HT" = '3000.00' WHERE "IDENT" = 'L06')");
  EXPECT_TRUE(selectionne("ecrit.txt"));
  ReportFixture::poser(w, "VDATEMAX", "30/11/2026");
  EXPECT_TRUE(selectionne("novembre.txt"));
}

class PiloteAvecEcriture : public host::ScriptedDriver {
 public:
  std::function<void()> pendant;
  void attenteJauge(int64_t done, int64_t total) override {
    if (pendant) std::exchange(pendant, nullptr)();
    ScriptedDriver::attenteJauge(done, total);
  }
};

TEST(Seletat1Test, AnotherUsersWriteDuringTheSelectionWaitsForNothingAndIsNotSeen) {
  ReportFixture f;
  Automate& w = f.preparer((f.t().dir() / "suivi.txt").string());
  ASSERT_EQ(f.lever(w, "VALID"), 0);
  const std::string avant = f.lignes();
  ASSERT_TRUE(contient(avant,
                       "0000000213|2|CF26000003 | BC CF26000003 | Reprise des murets de "
                       "la cour | 0.00 3600.00 0.00 0.00\n"));

  // Another user's session on the same file runs the same selection; a third connection moves
  // an amount from the first project to the last one while it reads.
  PiloteAvecEcriture pilote;
  host::Session autreSession(f.t().db(), pilote, "DEMO", "demo");
  autreSession.setDataDir(test::sourceDir() / "db");
  host::Session::Scope scope(autreSession);
  host::SqliteDatabase ecrivain(f.t().dir() / "test.db", false);
  ecrivain.delaiAttente(std::chrono::milliseconds(100));
  std::string echec = "not run";
  pilote.pendant = [&] {
    try {
      ecrivain.execScript(R"(BEGIN IMMEDIATE;
        UPDATE "QUARVO" SET "HT" = '2000.00' WHERE "IDENT" = 'L06';
        UPDATE "QUARVO" SET "HT" = '1950.00' WHERE "IDENT" = 'L12';
        INSERT INTO "QUARVO" ("IDENT","AFEBUD_IDENT","AFAFFA_IDENT","AFAFFA_CODE","AFLBUD_IDENT",
          "COMPOSANT","COMPOSANT_IDENT","PIECE","DATE_PIECE","QTE","HT") VALUES ('L15','0000000202',
          '0000000012','AFF002','0000000221','GAPECOM','0000000401','CF26000001','2026-07-01',1,'5.00');
        COMMIT;)");
      echec.clear();
    } catch (const std::exception& e) {
      echec = e.what();
    }
  };
  autreSession.appelerModule("QUARVO-SELETAT1", nullptr);
  Automate* ecran = autreSession.fenetre("QUARVO-SELETAT1");
  ASSERT_NE(ecran, nullptr);
  ReportFixture::poser(*ecran, "VDATEMIN", "01/04/2026");
  ReportFixture::poser(*ecran, "VDATEMAX", "31/12/2026");
  ReportFixture::poser(*ecran, "VSORTIE", "0");
  ReportFixture::poser(*ecran, "VFICHIER", (f.t().dir() / "autre.txt").string());
  host::EvtParamVal valider;
  ecran->raise("VALID", &valider);
  autreSession.executerEnAttente();
  EXPECT_EQ(echec, "");  // the writer did not wait for the report
  // (From here on the other session is the current one: its "M_APPR1" is read.)
  EXPECT_EQ(f.lignes(), avant);  // the report read the moment it began, whole
  EXPECT_EQ(ReportFixture::lire(f.t().dir() / "autre.txt"),
            ReportFixture::lire(f.t().dir() / "suivi.txt"));

  ecran->raise("VALID", &valider);
  autreSession.executerEnAttente();
  std::string apres = f.lignes();
  EXPECT_TRUE(contient(apres,
                       "0000000213|2|CF26000003 | BC CF26000003 | Reprise des murets de "
                       "la cour | 0.00 2600.00 0.00 0.00\n"));
  EXPECT_TRUE(contient(apres, "0.00 1950.00 0.00 0.00\n"));
  EXPECT_TRUE(contient(apres, "0000000221|2|CF26000001 |"));
}

}  // namespace
}  // namespace quarvo
