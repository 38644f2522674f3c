// The import window worked as a person works it: through the action interface.
#include <gtest/gtest.h>

#include "host/ui/ModeleEcran.h"
#include "quarvo/import/ImportSupport.h"
#include "support/Ecrans.h"

namespace quarvo {
namespace {

using host::ModeleEcran;
using test::champ;
using test::jouer;
using test::ligne;
namespace fs = std::filesystem;

TEST(ImporterEcranTest, FilesChosenRefusedAndImported) {
  test::TestSession t(true);
  auto d = t.dir().string();
  // Orders switched off; invoices allowed, with no default file.
  t.sql(
      "UPDATE \"AFPARA\" SET \"PARAM1\" = 'N' WHERE \"CODE\" = 'IMPORT_04';"
      "UPDATE \"AFPARA\" SET \"PARAM2\" = '' WHERE \"CODE\" <> 'IMPORT_04';");
  test::ecrireFichier(
      t, "ff.txt",
      test::enteteFf() +
          ligne({"FA26200001", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                 "1", "180", "0", "20", "", "", "", "", "F", "1"}) +
          ligne({"FA26200002", "15/12/2026", "NOBODY", "AFF001", "", "CABLE-3G2.5", "", "1", "180",
                 "0", "20", "", "", "", "", "F", "1"}));
  ModeleEcran m(t.session());
  ASSERT_EQ(m.ouvrir("QUARVO-IMPORTER"), ModeleEcran::Ouverture::Ouverte);

  EXPECT_EQ(jouer(m, "set V_FICHIER_CF " + d + "/cf.txt"),
            "refused on V_FICHIER_CF: V_FICHIER_CF est inactif.");
  EXPECT_EQ(jouer(m, "press V_FICHIER_CF_CHOISIR"),
            "refused on V_FICHIER_CF_CHOISIR: V_FICHIER_CF_CHOISIR est inactif.");
  // The chooser asks for a path; no path leaves the field as it was.
  EXPECT_EQ(jouer(m, "press V_FICHIER_FF_CHOISIR"), "ok | dialog Sélection d'un fichier:");
  EXPECT_EQ(jouer(m, "answer"), "ok");
  EXPECT_EQ(champ(m, "V_FICHIER_FF"), "");
  EXPECT_EQ(jouer(m, "press VALIDATION"),
            "refused on VALIDATION: La fenêtre a refusé press VALIDATION.");
  EXPECT_EQ(jouer(m, "press V_FICHIER_FF_CHOISIR"), "ok | dialog Sélection d'un fichier:");
  EXPECT_EQ(jouer(m, "answer " + d + "/ff.csv"), "ok");
  EXPECT_EQ(jouer(m, "press VALIDATION"),
            "refused on V_FICHIER_FF: [109] Le fichier des factures fournisseur doit avoir "
            "l'extension TXT. | [109] Le fichier des factures fournisseur doit avoir l'extension "
            "TXT.");
  EXPECT_EQ(jouer(m, "set V_FICHIER_FF " + d + "/ff.txt"), "ok");
  EXPECT_EQ(jouer(m, "set V_MODE 2"),
            "refused on V_MODE: V_MODE : « 2 » n'est pas une valeur permise (0, 1).");
  std::string done = jouer(m, "press VALIDATION");
  EXPECT_EQ(done.rfind("ok | [112] Import terminé avec des erreurs", 0), 0u) << done;
  // The window closed itself; what it held is still there to read.
  EXPECT_TRUE(m.etat().fenetres.empty());
  EXPECT_EQ(m.champsFermes().at("V_ERREUR_FF"), "1");
  EXPECT_TRUE(fs::exists(t.dir() / "ff.txt"));
  EXPECT_EQ(test::requete(t, R"(SELECT NUMERO_DOC FROM "GAPEFAC" WHERE IDENT > '0000001000')"),
            "FA26200001\n");
}

}  // namespace
}  // namespace quarvo
