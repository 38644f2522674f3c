#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include "host/ui/Ecran.h"
#include "host/value/Date.h"
#include "quarvo/import/ImportSupport.h"
#include "quarvo/import/QUARVOImporter_auto.h"

namespace quarvo {
namespace {

using test::ligne;
using test::requete;
namespace fs = std::filesystem;

std::string devisSain() {
  return test::enteteAutre() + ligne({"DF26200001", "07/09/2026", "LOCAPRO", "AFF003", "",
                                      "NACELLE-JOUR", "", "2", "180", "0", "20", "", "", "", "0"});
}

std::string facturesDontUneRefusee() {
  return test::enteteFf() +
         ligne({"FA26200001", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "1", "180", "0", "20", "", "", "", "", "F", "1"}) +
         ligne({"FA26200002", "15/12/2026", "NOBODY", "AFF001", "", "CABLE-3G2.5", "", "1", "180",
                "0", "20", "", "", "", "", "F", "1"});
}

// Settings of the four kinds: the default files in the test's folder; CF switched off.
void reglages(test::TestSession& t) {
  auto d = t.dir().string();
  t.sql("UPDATE \"AFPARA\" SET \"PARAM2\" = '" + d +
        "/df.Txt' WHERE \"CODE\" = 'IMPORT_03';"
        "UPDATE \"AFPARA\" SET \"PARAM1\" = 'N', \"PARAM2\" = '" +
        d +
        "/cf.txt' WHERE \"CODE\" = 'IMPORT_04';"
        "UPDATE \"AFPARA\" SET \"PARAM2\" = '' WHERE \"CODE\" = 'IMPORT_05';"
        "UPDATE \"AFPARA\" SET \"PARAM2\" = '" +
        d + "/ff.txt' WHERE \"CODE\" = 'IMPORT_06';");
}

host::Automate& ouvrir(test::TestSession& t) {
  host::EvtParamVal none;
  t.session().appelerModule("QUARVO-IMPORTER", &none);
  host::Automate* w = t.session().fenetre("QUARVO-IMPORTER");
  EXPECT_NE(w, nullptr);
  return *w;
}

void valider(host::Automate& w) {
  host::EvtParamVal none;
  w.raise("VALIDATION", &none);
}

TEST(ImporterTest, RefusedValidationsImportNothingAndKeepTheWindowOpen) {
  test::TestSession t(true);
  reglages(t);
  test::ecrireFichier(t, "df.Txt", devisSain());
  test::ecrireFichier(t, "cf.txt", devisSain());
  host::Automate& w = ouvrir(t);
  EXPECT_EQ(w.champ("V_FICHIER_DF")->text(), (t.dir() / "df.Txt").string());
  EXPECT_EQ(w.champ("V_FICHIER_CF")->text(), "");
  EXPECT_FALSE(w.ecran().controle("V_FICHIER_CF").actif);
  EXPECT_FALSE(w.ecran().controle("V_FICHIER_CF_CHOISIR").actif);

  // The chooser fills an allowed kind's field; a switched-off kind's button does nothing.
  t.ui().repondre((t.dir() / "autre.txt").string());
  host::EvtParamVal none;
  w.raise("V_FICHIER_DF_CHOISIR", &none);
  EXPECT_EQ(w.champ("V_FICHIER_DF")->text(), (t.dir() / "autre.txt").string());
  EXPECT_EQ(w.champ("V_DOSSIER")->text(), (t.dir() / "df.Txt").string());
  w.raise("V_FICHIER_CF_CHOISIR", &none);
  EXPECT_EQ(t.ui().transcriptText(),
            "FICHIER Sélection d'un fichier (Tous les fichiers (*.*)|*.*) -> " +
                (t.dir() / "autre.txt").string() + "\n");
  t.ui().clear();
  w.champ("V_FICHIER_DF")->set((t.dir() / "df.Txt").string());

  // A wrong extension on the last kind: even the sound DF file is not imported.
  w.champ("V_FICHIER_FF")->set((t.dir() / "ff.csv").string());
  valider(w);
  EXPECT_TRUE(w.rejete());
  EXPECT_EQ(w.ecran().focus(), "V_FICHIER_FF");
  // A missing file.
  w.champ("V_FICHIER_FF")->set((t.dir() / "absent.TXT").string());
  valider(w);
  EXPECT_EQ(w.ecran().focus(), "V_FICHIER_FF");
  // Nothing named at all (the switched-off kind's field does not count).
  w.champ("V_FICHIER_DF")->set("");
  w.champ("V_FICHIER_FF")->set("");
  w.champ("V_FICHIER_CF")->set((t.dir() / "cf.txt").string());
  valider(w);
  EXPECT_TRUE(w.rejete());
  EXPECT_EQ(w.ecran().focus(), "");
  EXPECT_EQ(t.ui().transcriptText(),
            "MESSAGE Information | [109] Le fichier des factures fournisseur doit avoir "
            "l'extension TXT. | [OK]\n"
            "MESSAGE Information | [110] Le fichier des factures fournisseur " +
                (t.dir() / "absent.TXT").string() + " est introuvable. | [OK]\n");
  EXPECT_FALSE(w.termine());
  EXPECT_TRUE(fs::exists(t.dir() / "df.Txt"));
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPEDEV" WHERE IDENT > '0000001000')"), "0\n");

  t.sql(R"(DELETE FROM "FRMT")");
  w.champ("V_FICHIER_DF")->set((t.dir() / "df.Txt").string());
  valider(w);
  EXPECT_NE(t.ui().transcriptText().find("[101] Le format d'échange EXCEL1 n'existe pas"),
            std::string::npos);
}

TEST(ImporterTest, ControlOnlyKeepsFilesAndImportDeletesOnlyCleanOnes) {
  test::TestSession t(true);
  reglages(t);
  test::ecrireFichier(t, "df.Txt", devisSain());
  test::ecrireFichier(t, "ff.txt", facturesDontUneRefusee());

  host::Automate& controle = ouvrir(t);
  controle.champ("V_MODE")->set(int64_t{0});
  valider(controle);
  EXPECT_TRUE(controle.termine());
  EXPECT_TRUE(fs::exists(t.dir() / "df.Txt"));
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPEDEV" WHERE IDENT > '0000001000')"), "0\n");

  host::Automate& import = ouvrir(t);
  valider(import);
  EXPECT_TRUE(import.termine());
  EXPECT_FALSE(fs::exists(t.dir() / "df.Txt"));  // clean: gone
  EXPECT_TRUE(fs::exists(t.dir() / "ff.txt"));   // one refused piece: kept
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC FROM "GAPEDEV" WHERE IDENT > '0000001000'
                         UNION ALL SELECT NUMERO_DOC FROM "GAPEFAC" WHERE IDENT > '0000001000')"),
            "DF26200001\nFA26200001\n");
  std::string transcript = t.ui().transcriptText();
  auto messages = [&] {
    std::string out;
    std::istringstream in(transcript);
    for (std::string l; std::getline(in, l);) {
      if (l.rfind("MESSAGE", 0) != 0) continue;
      size_t first = l.find(" | ");
      out += l.substr(0, l.find(" | ", first + 3)) + "\n";
    }
    return out;
  }();
  // The list is an aligned table, one error per line under its heading.
  std::string premiere =
      "IDENT       COMPOSANT     CODE        DESIG                              CMT";
  EXPECT_EQ(
      messages,
      "MESSAGE Information | [114] Contrôle terminé : des erreurs ont été trouvées. Consultez la "
      "liste des erreurs.\n"
      "MESSAGE Liste des erreurs d'import | " +
          premiere +
          "\n"
          "MESSAGE Information | [112] Import terminé avec des erreurs : les pièces en erreur "
          "n'ont pas été créées et leurs fichiers sont conservés. Consultez la liste des erreurs.\n"
          "MESSAGE Liste des erreurs d'import | " +
          premiere + "\n");
  EXPECT_NE(transcript.find("\n0000000001  IMM_PIECE_FF  FA26200002  Facture fournisseur no "
                            "FA26200002  Code fournisseur <NOBODY> inexistant\n"),
            std::string::npos)
      << transcript;

  // A file that passes the control but whose generation fails is kept for the next run.
  test::ecrireFichier(t, "df.Txt", devisSain());
  t.sql(R"(CREATE TRIGGER "REFUS" BEFORE INSERT ON "GAPEDEV"
           BEGIN SELECT RAISE(ABORT, 'refused'); END;
           DELETE FROM "GAPEDEV" WHERE IDENT > '0000001000';)");
  valider(ouvrir(t));
  EXPECT_TRUE(fs::exists(t.dir() / "df.Txt"));
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPEDEV" WHERE IDENT > '0000001000')"), "0\n");
  t.sql(R"(DROP TRIGGER "REFUS")");
  valider(ouvrir(t));
  EXPECT_FALSE(fs::exists(t.dir() / "df.Txt"));
}

std::string lire(const fs::path& p) {
  std::ifstream in(p);
  std::stringstream s;
  s << in.rdbuf();
  return s.str();
}

TEST(ImporterAutoTest, ImportsAllowedKindsAndEmptiesTheErrorsOnceReported) {
  test::TestSession t(true);
  reglages(t);
  test::ecrireFichier(t, "df.Txt", devisSain());
  test::ecrireFichier(t, "cf.txt", devisSain());  // switched off: never imported
  test::ecrireFichier(t, "ff.txt", facturesDontUneRefusee());
  // An error left by an earlier window import goes into this report.
  t.sql(
      R"(INSERT INTO "IMM_ERREUR" VALUES ('0000000001', 'IMM_PIECE_BF', 'BR9', 'Bon de réception no BR9', 'ancienne'))");
  // The report's folder cannot be made at first: the errors must stay.
  test::ecrireFichier(t, "VOVOVA", "not a folder");
  host::EvtParamVal none;
  EXPECT_EQ(t.session().appelerModule("QUARVO-IMPORTER_AUTO", &none), 1);
  // The old error, and the unknown supplier with the VAT rate it cannot have.
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_ERREUR")"), "3\n");
  EXPECT_FALSE(fs::exists(t.dir() / "df.Txt"));
  EXPECT_TRUE(fs::exists(t.dir() / "cf.txt"));
  EXPECT_TRUE(fs::exists(t.dir() / "ff.txt"));
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPECOM" WHERE IDENT > '0000001000')"), "0\n");

  fs::remove(t.dir() / "VOVOVA");
  EXPECT_EQ(t.session().appelerModule("QUARVO-IMPORTER_AUTO", &none), 0);
  fs::path report = QUARVOImporter_auto::cheminRapport("DEMO", host::Date::today());
  EXPECT_EQ(report.parent_path(), t.dir() / "VOVOVA" / "DEMO.$so" / "rapports");
  std::string today = host::Date::today().text();
  EXPECT_EQ(report.filename().string(),
            "ierreurs_ach_" + today.substr(0, 2) + today.substr(3, 2) + today.substr(6) + ".txt");
  std::string text = lire(report);
  EXPECT_NE(text.find("ancienne"), std::string::npos);
  EXPECT_NE(text.find("Code fournisseur <NOBODY> inexistant"), std::string::npos);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_ERREUR")"), "0\n");

  // A run without errors writes nothing more.
  fs::remove(t.dir() / "ff.txt");
  EXPECT_EQ(t.session().appelerModule("QUARVO-IMPORTER_AUTO", &none), 0);
  EXPECT_EQ(lire(report), text);
  EXPECT_EQ(t.ui().transcriptText().find("MESSAGE"), std::string::npos);
}

}  // namespace
}  // namespace quarvo
