// The report's selection screen worked as a person works it: through the action interface.
#include <gtest/gtest.h>

#include <filesystem>

#include "host/ui/ModeleEcran.h"
#include "quarvo/report/ReportFixture.h"
#include "support/Ecrans.h"

namespace quarvo {
namespace {

using host::ModeleEcran;
using test::actif;
using test::champ;
using test::jouer;

TEST(Seletat1EcranTest, TheScreensRulesRunAsAPersonTypes) {
  test::ReportFixture f;
  auto file = f.t().dir() / "suivi.txt";
  ModeleEcran m(f.t().session(), &f.t().ui());
  ASSERT_EQ(m.ouvrir("QUARVO-SELETAT1"), ModeleEcran::Ouverture::Ouverte);
  EXPECT_EQ(champ(m, "VDATEMIN"), "01/12/2026");  // the company's current month

  // The recapitulations wait for a grouping criterion; choosing one labels it and allows them.
  EXPECT_EQ(jouer(m, "set VRECAP1 1"), "refused on VRECAP1: VRECAP1 est inactif.");
  EXPECT_EQ(jouer(m, "set VCLASSEMENT Client"), "ok");
  EXPECT_EQ(champ(m, "VCLASSEMENT") + " " + champ(m, "VCLASSEMENT_LIB"), "AFCLIE Client");
  EXPECT_TRUE(actif(m, "VRECAP1"));
  // The print options follow their rules.
  EXPECT_EQ(jouer(m, "set VFOLIO 0"), "ok");
  EXPECT_EQ(champ(m, "VCORPS") + champ(m, "VCORPS2"), "00");
  EXPECT_EQ(jouer(m, "press VALID"),
            "refused on VFOLIO: [99] Choisissez au moins une partie à imprimer : le détail par "
            "affaire ou l'un des récapitulatifs. | [99] Choisissez au moins une partie à "
            "imprimer : le détail par affaire ou l'un des récapitulatifs.");
  EXPECT_EQ(jouer(m, "set VCORPS2 1"), "ok");
  EXPECT_EQ(champ(m, "VFOLIO") + champ(m, "VCORPS"), "11");

  EXPECT_EQ(jouer(m, "set VDATEMIN 01/04/2026"), "ok");
  EXPECT_EQ(jouer(m, "set VDATEMAX 31/13/2026"),
            "refused on VDATEMAX: VDATEMAX : « 31/13/2026 » n'est pas une date (jj/mm/aaaa).");
  EXPECT_EQ(jouer(m, "set VDATEMAX 15/01/2027"), "ok");
  EXPECT_EQ(
      jouer(m, "press VALID").rfind("refused on VDATEMAX: [100] La date de fin de période", 0), 0u);
  EXPECT_EQ(jouer(m, "set VDATEMAX 31/12/2026"), "ok");
  EXPECT_EQ(jouer(m, "set VSORTIE Tableur"), "ok");
  EXPECT_EQ(jouer(m, "set VFICHIER " + file.string()), "ok");
  f.t().ui().clear();
  EXPECT_EQ(jouer(m, "press VALID"), "ok");
  // The walk showed its progress through the model, which is gone once it ended.
  EXPECT_EQ(f.t().ui().transcriptText(),
            "ATTENTE Sélection en cours\nJAUGE 0/1\nJAUGE 3/3\nFIN ATTENTE\n");
  EXPECT_FALSE(m.etat().progression);
  EXPECT_TRUE(std::filesystem::exists(file));
  EXPECT_NE(f.lignes().find("0000000213|2|CF26000003 | BC CF26000003"), std::string::npos);
  // The screen stays open for another selection.
  EXPECT_EQ(m.etat().fenetres.size(), 1u);
}

}  // namespace
}  // namespace quarvo
