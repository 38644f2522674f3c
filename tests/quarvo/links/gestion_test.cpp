// The link document worked as a controller works it: through the action interface, on a fresh
// demo database, with what reaches the link table and the budget line's figures checked after.
#include <gtest/gtest.h>

#include <algorithm>
#include <optional>
#include <sstream>

#include "app/FiguresCommand.h"
#include "host/automate/Registry.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"
#include "support/Audit.h"
#include "support/Ecrans.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using host::ModeleEcran;

constexpr const char* kBudget = "0000000201";
constexpr const char* kMaconnerie = "0000000213";  // order CF26000003 buys for it

class GestionTest : public ::testing::Test {
 protected:
  ModeleEcran::Ouverture ouvrir(const std::string& line, const std::string& budget = kBudget,
                                const std::string& modes = "VMCA") {
    m_.reset();  // one model works a session at a time
    m_ = std::make_unique<ModeleEcran>(t_.session());
    return m_->appeler("QUARVO", "GESTION", {budget, line, modes});
  }
  std::string jouer(const std::string& line) { return test::jouer(*m_, line); }
  std::string champ(const std::string& field) { return test::champ(*m_, field); }
  // The rows the list shows: piece, quantity, amount.
  std::string lignes() {
    std::string out;
    if (m_->etat().fenetres.empty()) return "(closed)";
    for (const auto& row : m_->etat().fenetres.back().listes.front().lignes) {
      out += row[0] + " " + row[3] + " " + row[4] + "\n";
    }
    return out;
  }
  // The link rows of the line in the database, and its committed and realised figures.
  std::string enBase(const std::string& line = kMaconnerie) {
    std::string out;
    host::Table liens(nullptr, "VOVOVA", "QUARVO", "TEST");
    liens.effacerCriteres();
    liens.ajouterCritere("AFLBUD_IDENT", '=', host::Valeur::chaine(line));
    while (liens.lire(1) == 0) {
      out += liens.valeur("PIECE").toChaine() + " " + liens.valeur("QTE").toChaine() + " " +
             liens.valeur("HT").toChaine() + "\n";
    }
    return out + "engagé " + t_.value("AFLBUD", "VENG", "IDENT", line) + ", réalisé " +
           t_.value("AFLBUD", "VREA", "IDENT", line);
  }
  ::testing::AssertionResult propre() { return test::sansEcart(t_.session()); }

  test::TestSession t_{true};
  std::unique_ptr<ModeleEcran> m_;
};

TEST_F(GestionTest, AnOrderEnteredSavedAndSavedAgainBooksItsAmountOnce) {
  ASSERT_EQ(ouvrir(kMaconnerie), ModeleEcran::Ouverture::Ouverte);
  const auto& w = m_->etat().fenetres.back();
  EXPECT_EQ(w.ecran, "GESTION");
  EXPECT_EQ(w.onglet, "P1");  // a company linking orders: an empty document opens on them
  EXPECT_EQ(w.mode, "V");
  EXPECT_EQ(champ("VLIGNE_DESIG"), "Sous-traitance maçonnerie");
  EXPECT_EQ(jouer("press B_VALID_DOC"), "refused on B_VALID_DOC: B_VALID_DOC est inactif.");

  EXPECT_EQ(jouer("new LST"), "ok");
  EXPECT_EQ(jouer("cell LST 1 LST_C1 CF99999999"),
            "refused on LST_C1: [87] Aucune pièce de ce type ne porte ce numéro. | [87] Aucune "
            "pièce de ce type ne porte ce numéro.");
  EXPECT_EQ(jouer("cell LST 1 LST_C1 CF26000003"), "ok");
  EXPECT_EQ(lignes(), "CF26000003 80 3600.00\n");
  EXPECT_EQ(enBase(), "engagé 0.00, réalisé 0.00;0.00;0.00");  // nothing written before the save
  EXPECT_EQ(jouer("press B_VALID_DOC"), "ok");
  EXPECT_EQ(m_->etat().fenetres.back().mode, "V");
  EXPECT_EQ(enBase(), "CF26000003 80 3600.00\nengagé 3600.00, réalisé 0.00;0.00;0.00");
  EXPECT_EQ(champ("VTOT_GAPECOM"), "3600.00");
  EXPECT_TRUE(propre());

  // The same piece again is refused, here as before the save.
  EXPECT_EQ(jouer("new LST"), "ok");
  EXPECT_NE(jouer("cell LST 2 LST_C1 CF26000003").find("refused on LST: [88]"), std::string::npos);
  EXPECT_EQ(jouer("press B_ABAND_LIGNE"), "ok");

  // The piece changes in the purchasing module; consulting it brings the line in step, and a
  // second save withdraws and books the line once more, not twice.
  t_.sql(R"(UPDATE "GAPLCOM" SET "QTE" = 60, "HT" = '2700.00', "BRUT" = '2700.00'
            WHERE "NUMERO" LIKE '0000000403|%';
            UPDATE "GAPECOM" SET "BRUT" = '2700.00', "HT" = '2700.00', "HEURE_MAJ" = '23:59:59'
            WHERE "IDENT" = '0000000403';)");
  std::string consulte = jouer("press CONSULTER_PIECE");
  if (!m_->etat().fenetres.empty() && m_->etat().fenetres.back().ecran != "GESTION") {
    EXPECT_EQ(consulte, "ok");
    EXPECT_EQ(jouer("press FERMER"), "ok");
  }
  EXPECT_EQ(lignes(), "CF26000003 60 2700.00\n") << consulte;
  EXPECT_EQ(jouer("press B_VALID_DOC"), "ok");
  EXPECT_EQ(jouer("close"), "ok");
  EXPECT_TRUE(m_->etat().fenetres.empty());
  EXPECT_EQ(enBase(), "CF26000003 60 2700.00\nengagé 2700.00, réalisé 0.00;0.00;0.00");
  EXPECT_TRUE(propre());
}

TEST_F(GestionTest, QuestionNinetySevenLinksPartAllOrNothing) {
  t_.sql(R"(UPDATE "AFLBUD" SET "QBUD" = 50 WHERE "IDENT" = '0000000213')");
  ASSERT_EQ(ouvrir(kMaconnerie), ModeleEcran::Ouverture::Ouverte);
  EXPECT_EQ(jouer("new LST"), "ok");
  EXPECT_EQ(jouer("cell LST 1 LST_C1 CF26000003"),
            "ok | dialog Choix: Pointer seulement la quantité disponible Pointer la totalité de "
            "la pièce Revenir à la saisie");
  EXPECT_EQ(jouer("answer 3").rfind("refused", 0), 0u);  // back: nothing linked
  EXPECT_EQ(lignes(), " 0 0.00\n");
  jouer("cell LST 1 LST_C1 CF26000003");
  EXPECT_EQ(jouer("answer 1"), "ok");  // part: what is free, the amount in proportion
  EXPECT_EQ(lignes(), "CF26000003 50 2250.00\n");
  EXPECT_EQ(jouer("press B_VALID_DOC"), "ok");
  EXPECT_EQ(enBase(), "CF26000003 50 2250.00\nengagé 2250.00, réalisé 0.00;0.00;0.00");
  // Consulting an unchanged piece asks nothing and changes nothing: the line's own quantity is
  // not counted against it.
  std::string consulte = jouer("press CONSULTER_PIECE");
  if (!m_->etat().fenetres.empty() && m_->etat().fenetres.back().ecran != "GESTION") {
    jouer("press FERMER");
  }
  EXPECT_FALSE(m_->etat().dialogue);
  EXPECT_EQ(m_->etat().fenetres.back().mode, "V");
  // Deleted and typed again: all of it this time.
  EXPECT_EQ(jouer("delete LST 1"), "ok");
  EXPECT_EQ(jouer("new LST"), "ok");
  jouer("cell LST 1 LST_C1 CF26000003");
  EXPECT_EQ(jouer("answer Pointer la totalité de la pièce"), "ok");
  EXPECT_EQ(lignes(), "CF26000003 80 3600.00\n");
  EXPECT_EQ(jouer("press B_VALID_DOC"), "ok");
  EXPECT_EQ(enBase(), "CF26000003 80 3600.00\nengagé 3600.00, réalisé 0.00;0.00;0.00");
  EXPECT_TRUE(propre());
}

TEST_F(GestionTest, DeletingThenAbandoningChangesNothing) {
  ASSERT_EQ(ouvrir(kMaconnerie), ModeleEcran::Ouverture::Ouverte);
  jouer("new LST");
  jouer("cell LST 1 LST_C1 CF26000003");
  ASSERT_EQ(jouer("press B_VALID_DOC"), "ok");
  std::string avant = enBase();
  EXPECT_EQ(jouer("delete LST 1"), "ok");
  EXPECT_EQ(lignes(), "");
  EXPECT_EQ(m_->etat().fenetres.back().mode, "M");
  EXPECT_EQ(jouer("tab P3"), "refused on P3: La fenêtre a refusé tab P3.");  // save first
  EXPECT_EQ(jouer("close"), "ok | dialog Question: Oui Non Annuler");
  EXPECT_EQ(jouer("answer Non"), "ok");
  EXPECT_TRUE(m_->etat().fenetres.empty());
  EXPECT_EQ(enBase(), avant);
  EXPECT_TRUE(propre());
}

TEST_F(GestionTest, ATransformedOrderAddsItsReceiptOnceOnTheReceiptsTab) {
  ASSERT_EQ(ouvrir(kMaconnerie), ModeleEcran::Ouverture::Ouverte);
  jouer("new LST");
  jouer("cell LST 1 LST_C1 CF26000003");
  ASSERT_EQ(jouer("press B_VALID_DOC"), "ok");
  EXPECT_EQ(jouer("press VALIDER_PIECE"), "refused on VALIDER_PIECE: VALIDER_PIECE est inactif.");
  auto receptions = [] {
    host::Table bl(nullptr, "GESCOM", "GAPEBL", "TEST");
    bl.effacerCriteres();
    return bl.compter();
  };
  int64_t avant = receptions();
  // Not confirmed: nothing is transformed, nothing added.
  EXPECT_EQ(jouer("press TRANSFORMER_BR"), "ok | dialog Question: Oui Non");
  EXPECT_EQ(jouer("answer Non"), "ok");
  EXPECT_EQ(m_->etat().fenetres.back().onglet, "P1");
  EXPECT_EQ(receptions(), avant);
  EXPECT_EQ(jouer("press TRANSFORMER_BR"), "ok | dialog Question: Oui Non");
  std::string ajout = jouer("answer Oui");
  EXPECT_EQ(ajout, "ok");
  EXPECT_EQ(m_->etat().fenetres.back().onglet, "P2");
  std::string recues = lignes();
  ASSERT_EQ(std::count(recues.begin(), recues.end(), '\n'), 1) << recues;
  EXPECT_EQ(recues.rfind("BR", 0), 0u) << recues;
  EXPECT_EQ(jouer("press B_VALID_DOC"), "ok");
  EXPECT_TRUE(propre());
  // The order has nothing left to receive: a second transformation adds nothing.
  ASSERT_EQ(jouer("tab P1"), "ok");
  jouer("press TRANSFORMER_BR");
  if (m_->etat().dialogue) jouer("answer Oui");
  EXPECT_EQ(jouer("tab P2"), "ok");
  EXPECT_EQ(lignes(), recues);
  EXPECT_EQ(receptions(), avant + 1);
  EXPECT_EQ(jouer("close"), "ok");
}

TEST_F(GestionTest, ADocumentOnALineOfAnotherBudgetRefusesToOpen) {
  EXPECT_EQ(ouvrir(kMaconnerie, "0000000202"), ModeleEcran::Ouverture::Refusee);
  ASSERT_FALSE(m_->etat().messages.empty());
  EXPECT_EQ(m_->etat().messages.back().rfind("[17] La ligne budgétaire 0000000213", 0), 0u);
  EXPECT_EQ(ouvrir("0000009999"), ModeleEcran::Ouverture::Refusee);
  // Without the right to create lines, a new line is refused.
  ASSERT_EQ(ouvrir(kMaconnerie, kBudget, "V"), ModeleEcran::Ouverture::Ouverte);
  EXPECT_EQ(jouer("new LST"),
            "refused on LST: Ce document ne permet pas la création de lignes. | Ce document ne "
            "permet pas la création de lignes.");
}

TEST(RegistrationTest, TheModulesTwentyFiveAutomataComeFirstInTheirUnitsOrder) {
  // The module's, as the program lists them (the tests register automata of their own).
  std::vector<std::string> names;
  for (const auto& n : host::Registry::instance().names()) {
    if (n.rfind("QUARVO-", 0) == 0 || n.rfind("TEST-", 0) != 0) names.push_back(n);
  }
  ASSERT_GE(names.size(), 25u);
  std::vector<std::string> premiers(names.begin(), names.begin() + 25);
  EXPECT_EQ(premiers, (std::vector<std::string>{"QUARVO-ANALYSER",
                                                "QUARVO-ANNULER1",
                                                "QUARVO-ANNULER",
                                                "QUARVO-EXISTE_CHAINAGE_AVAL",
                                                "QUARVO-GESTION",
                                                "QUARVO-EXPETAT1",
                                                "QUARVO-IMPETAT1",
                                                "QUARVO-SELETAT1",
                                                "QUARVO-IMPORTER",
                                                "QUARVO-IMPORTER_AUTO",
                                                "QUARVO-IMPORT_CONTROLER_BF",
                                                "QUARVO-IMPORT_CONTROLER_CF",
                                                "QUARVO-IMPORT_CONTROLER_DF",
                                                "QUARVO-IMPORT_CONTROLER_FF",
                                                "QUARVO-IMPORT_GENERER_BF",
                                                "QUARVO-IMPORT_GENERER_CF",
                                                "QUARVO-IMPORT_GENERER_DF",
                                                "QUARVO-IMPORT_GENERER_FF",
                                                "QUARVO-SOLDER",
                                                "QUARVO-IMPUTER1",
                                                "QUARVO-IMPUTER",
                                                "QUARVO-IMPUTER_AUTO",
                                                "QUARVO-IMPUTER_PIECES",
                                                "QUARVO-POINTER_PIECES",
                                                "QUARVO-INTERFACE"}));
}

}  // namespace
}  // namespace quarvo
