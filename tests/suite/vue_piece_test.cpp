// A piece's own window opened through the screen model, as the link document opens it: what it
// shows, that nothing in it can be changed, and that it refuses to open on a missing piece.
#include <gtest/gtest.h>

#include "host/ui/ModeleEcran.h"
#include "support/Ecrans.h"
#include "support/TestSession.h"

namespace quarvo::suite {
namespace {

using host::ModeleEcran;

class VuePieceTest : public ::testing::Test {
 protected:
  ModeleEcran::Ouverture ouvrir(const std::string& automate, const std::string& piece) {
    return m_.ouvrir(automate, {piece, "VMC"});
  }
  std::string champ(const std::string& nom) { return test::champ(m_, nom); }
  std::string lignes() {
    std::string out;
    for (const auto& row : m_.etat().fenetres.back().listes.front().lignes) {
      for (const auto& cell : row) out += cell + "|";
      out += "\n";
    }
    return out;
  }

  test::TestSession t_{true};
  ModeleEcran m_{t_.session()};
};

TEST_F(VuePieceTest, AnOrderIsShownWithItsLinesAndNothingCanBeChanged) {
  ASSERT_EQ(ouvrir("GAPECOM-GESTION", "0000000402"), ModeleEcran::Ouverture::Ouverte);
  const auto& fenetre = m_.etat().fenetres.back();
  EXPECT_EQ(fenetre.ecran, "PIECE");
  EXPECT_EQ(fenetre.titre, "Commande fournisseur CF26000002");
  EXPECT_EQ(fenetre.mode, "V");
  EXPECT_EQ(champ("NUMERO_DOC") + " " + champ("DATE_CREATION") + " " + champ("FOURNISSEUR") + " " +
                champ("VALIDEE") + " " + champ("HT") + " " + champ("QTNT"),
            "CF26000002 10/04/2026 HYDROSAN 1 1260.00 20");
  EXPECT_EQ(lignes(),
            "1|TUBE-PER16|Tube PER Ø 16 (couronne de 50 m)|10|95.00|950.00|\n"
            "2|ROBINET-EQ|Robinet d'équerre 1/2\"|20|12.50|250.00|\n");
  EXPECT_EQ(test::jouer(m_, "set DESIG Autre chose"), "refused on DESIG: DESIG ne se saisit pas.");
  EXPECT_EQ(test::jouer(m_, "press FERMER"), "ok");
  EXPECT_TRUE(m_.etat().fenetres.empty());
  EXPECT_EQ(m_.resultatFerme(), 0);
}

TEST_F(VuePieceTest, ATimeEntryShowsItsHoursAndProjectsByCode) {
  ASSERT_EQ(ouvrir("AFEFFO-GESTION", "0000000701"), ModeleEcran::Ouverture::Ouverte);
  EXPECT_EQ(m_.etat().fenetres.back().ecran, "AFEFFO");
  EXPECT_EQ(champ("RESSOURCE") + " " + champ("QTE") + " " + champ("HT"), "TECH01 12 420.00");
  EXPECT_EQ(lignes(),
            "1|Pose des tableaux électriques|AFF001|MO-TECH|8|35.00|280.00|\n"
            "2|Essais de pression du réseau|AFF002|MO-TECH|4|35.00|140.00|\n");
}

TEST_F(VuePieceTest, AMissingPieceIsSaidAndTheWindowDoesNotOpen) {
  EXPECT_EQ(ouvrir("GAPEBL-GESTION", "0000000401"), ModeleEcran::Ouverture::Refusee);
  EXPECT_TRUE(m_.etat().fenetres.empty());
  ASSERT_FALSE(m_.etat().messages.empty());
  EXPECT_EQ(m_.etat().messages.back(),
            "Bon de réception : la pièce 0000000401 n'existe pas, elle ne peut pas être "
            "affichée.");
}

}  // namespace
}  // namespace quarvo::suite
