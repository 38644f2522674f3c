#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "app/ImportCommand.h"
#include "app/Workspace.h"
#include "quarvo/import/ImportSupport.h"

namespace quarvo {
namespace {

namespace fs = std::filesystem;
using test::requete;

// The demo import files, copied into the test's folder.
app::ImportOptions fichiersDemo(test::TestSession& t) {
  app::ImportOptions o;
  for (const char* kind : {"df", "cf", "bf", "ff"}) {
    fs::copy_file(test::sourceDir() / "db" / "demo" / (std::string(kind) + "_achats.txt"),
                  t.dir() / (std::string(kind) + "_achats.txt"));
  }
  o.df = (t.dir() / "df_achats.txt").string();
  o.cf = (t.dir() / "cf_achats.txt").string();
  o.bf = (t.dir() / "bf_achats.txt").string();
  o.ff = (t.dir() / "ff_achats.txt").string();
  return o;
}

TEST(ImportCommandTest, DemoFilesAreControlledThenImportedWithTheirErrorsListed) {
  test::TestSession t(true);
  app::ImportOptions o = fichiersDemo(t);
  o.checkOnly = true;
  std::ostringstream out;
  EXPECT_EQ(app::runImport(t.session(), o, out), 1);
  // The window's error list shows the errors, once, as an aligned table; the command adds no
  // second copy of it.
  EXPECT_EQ(out.str(), "");
  std::string shown = t.ui().transcriptText();
  auto lists = [](const std::string& text) {
    size_t n = 0;
    for (size_t at = text.find("Liste des erreurs"); at != std::string::npos;
         at = text.find("Liste des erreurs", at + 1)) {
      ++n;
    }
    return n;
  };
  EXPECT_EQ(lists(shown), 1u) << shown;
  for (const char* row :
       {"IDENT       COMPOSANT     CODE        DESIG                               CMT\n",
        "0000000001  IMM_PIECE_DF  DF26100002  Devis fournisseur no DF26100002     Code article "
        "<NACELLE-XXL> inexistant\n",
        "0000000002  IMM_PIECE_CF  CF26100003  Commande fournisseur no CF26100003  Date de pièce "
        "supérieure au mois en cours\n",
        "0000000004  IMM_PIECE_BF  BR26100002  Bon de réception no BR26100002      Code budget "
        "<BU-INCONNU> inexistant\n",
        "0000000005  IMM_PIECE_FF  FA26100003  Facture fournisseur no FA26100003   Code "
        "fournisseur <INCONNU> inexistant"}) {
    EXPECT_NE(shown.find(row), std::string::npos) << row;
  }
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPECOM" WHERE IDENT > '0000001000')"), "0\n");

  // Imported: the sound pieces are created, every file (each has a faulty piece) stays.
  o.checkOnly = false;
  std::ostringstream imported;
  t.ui().clear();
  EXPECT_EQ(app::runImport(t.session(), o, imported), 1);
  EXPECT_NE(t.ui().transcriptText().find("0000000007  IMM_PIECE_DF"), std::string::npos);
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC FROM "GAPEDEV" WHERE IDENT > '0000001000'
                         UNION ALL SELECT NUMERO_DOC FROM "GAPECOM" WHERE IDENT > '0000001000'
                         UNION ALL SELECT NUMERO_DOC FROM "GAPEBL" WHERE IDENT > '0000001000'
                         UNION ALL SELECT NUMERO_DOC FROM "GAPEFAC" WHERE IDENT > '0000001000')"),
            "DF26100001\nCF26100001\nCF26100002\nBR26100001\nAV26100002\nFA26100001\n");
  EXPECT_TRUE(fs::exists(o.ff));

  // Unattended, from the settings: the errors go to the day's report.
  t.sql("UPDATE \"AFPARA\" SET \"PARAM2\" = '" + o.ff +
        "' WHERE \"CODE\" = 'IMPORT_06';"
        "UPDATE \"AFPARA\" SET \"PARAM1\" = 'N' WHERE \"CODE\" IN ('IMPORT_03', 'IMPORT_04', "
        "'IMPORT_05')");
  app::ImportOptions automatique;
  automatique.automatique = true;
  std::ostringstream report;
  EXPECT_EQ(app::runImport(t.session(), automatique, report), 1);
  EXPECT_EQ(report.str().rfind("errors were found: report written to " + t.dir().string() +
                                   "/VOVOVA/DEMO.$so/rapports/ierreurs_ach_",
                               0),
            0u)
      << report.str();
  EXPECT_THROW(app::runImport(t.session(), app::ImportOptions{}, report), app::UsageError);
}

}  // namespace
}  // namespace quarvo

namespace quarvo {
namespace {

TEST(ImportCommandTest, ALineWhoseAmountIsOutOfRangeRefusesItsPieceOnly) {
  test::TestSession t(true);
  std::string file =
      test::enteteAutre() +
      test::ligne({"CF26800001", "05/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                   "2", "180", "0", "20", "", "", "", "0"}) +
      test::ligne({"CF26800002", "05/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                   "1000000000", "10000000", "0", "20", "", "", "", "0"});
  app::ImportOptions o;
  o.cf = test::ecrireFichier(t, "cf.txt", file).string();
  std::ostringstream out;
  EXPECT_EQ(app::runImport(t.session(), o, out), 1);
  EXPECT_EQ(test::requete(t, R"(SELECT NUMERO_DOC FROM "GAPECOM" WHERE IDENT > '0000001000')"),
            "CF26800001\n");
  EXPECT_EQ(test::requete(t, R"(SELECT CODE, CMT FROM "IMM_ERREUR")"),
            "CF26800002|Ligne 3, colonne PUHT, valeur 10000000.00 : montant de la ligne (QTE × "
            "PUHT) hors limites\n");
}

}  // namespace
}  // namespace quarvo
