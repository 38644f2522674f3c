// The imputation selection and a piece's detail, worked as a controller works them: through the
// action interface on a fresh demo database, with the links and figures checked after.
#include <gtest/gtest.h>

#include <fstream>
#include <optional>
#include <sstream>

#include "app/FiguresCommand.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"
#include "support/Audit.h"
#include "support/Ecrans.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using host::ModeleEcran;

class ImputerEcranTest : public ::testing::Test {
 protected:
  void SetUp() override {
    // Two more budget lines of the electrical material in the 2026 budget of AFF001: a line of
    // order CF26000001 may then be spread over three.
    copierLigne("0000000216", "0000000201|6");
    copierLigne("0000000217", "0000000201|7");
    m_ = std::make_unique<ModeleEcran>(t_.session());
    ASSERT_EQ(m_->ouvrir("QUARVO-IMPUTER"), ModeleEcran::Ouverture::Ouverte);
  }
  void copierLigne(const std::string& ident, const std::string& numero) {
    host::Table source(nullptr, "VOVOVA", "AFLBUD", "TEST");
    ASSERT_EQ(source.chercher(3, "IDENT", '=', host::Valeur::chaine("0000000211")), 0);
    host::Table copie(nullptr, "VOVOVA", "AFLBUD", "TEST_COPIE");
    copie.preparer();
    for (const auto& c : source.store().schema().columns()) {
      copie.ecrire(c.name, source.valeur(c.name));
    }
    copie.ecrire("IDENT", host::Valeur::chaine(ident));
    copie.ecrire("NUMERO", host::Valeur::chaine(numero));
    ASSERT_EQ(copie.inserer(), 0);
  }
  std::string jouer(const std::string& line) { return test::jouer(*m_, line); }
  // The proposal: the selection typed in, the pointing confirmed.
  void proposer() {
    ASSERT_EQ(jouer("set VTYPE_PIECE C"), "ok");
    ASSERT_EQ(jouer("set VAFFA_TOUTES U"), "ok");
    ASSERT_EQ(jouer("set VAFFA_CODE AFF001"), "ok");
    ASSERT_EQ(jouer("press AVANCER").find("dialog Question"), 5u);
    ASSERT_EQ(jouer("answer Oui"), "ok");
  }
  // The row of the list that shows piece `numero`.
  size_t rang(const std::string& numero) {
    const auto& w = m_->etat().fenetres.back();
    for (const auto& l : w.listes) {
      if (l.nom != "LST") continue;
      for (size_t i = 0; i < l.lignes.size(); ++i) {
        if (l.lignes[i][1] == numero) return i + 1;
      }
    }
    return 0;
  }
  std::string liens(const std::string& piece) {
    std::string out;
    host::Table t(nullptr, "VOVOVA", "QUARVO", "TEST");
    t.effacerCriteres();
    t.ajouterCritere("PIECE", '=', host::Valeur::chaine(piece));
    while (t.lire(1) == 0) {
      out += t.valeur("AFLBUD_IDENT").toChaine() + " " + t.valeur("QTE").toChaine() + " " +
             t.valeur("HT").toChaine() + "\n";
    }
    return out;
  }
  ::testing::AssertionResult propre() { return test::sansEcart(t_.session()); }

  test::TestSession t_{true};
  std::unique_ptr<ModeleEcran> m_;
};

TEST_F(ImputerEcranTest, APieceSplitOverThreeBudgetLinesIsLinkedAsSplit) {
  // The tabs move only with the buttons: the pointing is never skipped.
  EXPECT_EQ(jouer("tab P3"), "refused on ONGLET: ONGLET est inactif.");
  // The seven period buttons: the fourth is the month before the company's current one.
  EXPECT_EQ(jouer("press BORNE4"), "ok");
  EXPECT_EQ(test::champ(*m_, "VDATEMIN") + "-" + test::champ(*m_, "VDATEMAX"),
            "01/11/2026-30/11/2026");
  EXPECT_EQ(jouer("press BORNE6"), "ok");  // the calendar year
  EXPECT_EQ(test::champ(*m_, "VDATEMIN"), "01/01/2026");
  EXPECT_EQ(jouer("set VDATEMAX"),
            "refused on VDATEMAX: [65] La date de fin de période est obligatoire. | [65] La date "
            "de fin de période est obligatoire.");
  proposer();
  size_t r = rang("CF26000001");
  ASSERT_NE(r, 0u);
  EXPECT_EQ(jouer("select LST " + std::to_string(r)), "ok");
  EXPECT_EQ(test::champ(*m_, "VPIECE"), "BC CF26000001");
  EXPECT_EQ(jouer("press GERER_IMPUTATION"), "ok");
  ASSERT_EQ(m_->etat().fenetres.back().ecran, "IMPUTER1");
  EXPECT_EQ(m_->etat().fenetres.back().titre,
            "Imputation de la commande fournisseur n° CF26000001");
  // While the detail is open, the selection does not take actions.
  host::Action valider = *host::lireAction("press VALID");
  valider.fenetre = "IMPUTER";
  EXPECT_FALSE(m_->agir(valider));
  const auto& allocations = m_->etat().fenetres.back().listes.back();
  ASSERT_EQ(allocations.lignes.size(), 3u);
  EXPECT_EQ(jouer("cell LSTV 1 LSTV_C5 -1").rfind("refused on LSTV_C5", 0), 0u);  // opposite sign
  EXPECT_EQ(jouer("cell LSTV 1 LSTV_C5 2.4"), "ok");
  EXPECT_EQ(jouer("cell LSTV 2 LSTV_C5 1.2"), "ok");
  EXPECT_EQ(jouer("press VALID").rfind("refused on LSTV: [116]", 0), 0u);  // 3.6 of 4
  EXPECT_EQ(jouer("cell LSTV 3 LSTV_C5 0.4"), "ok");
  EXPECT_EQ(test::champ(*m_, "V_TOT_QTE"), "4");
  EXPECT_EQ(jouer("press VALID"), "ok");
  ASSERT_EQ(m_->etat().fenetres.back().ecran, "IMPUTER");
  // Split, the piece is no longer in error; the controller ticks it for imputation.
  EXPECT_EQ(m_->etat().fenetres.back().listes.front().lignes[r - 1][5], "0");
  EXPECT_EQ(jouer("cell LST " + std::to_string(r) + " LST_C5 O"), "ok");
  EXPECT_EQ(jouer("press VALID"), "ok | dialog Question: Oui Non");
  EXPECT_EQ(jouer("answer Oui"), "ok");
  EXPECT_EQ(liens("CF26000001"),
            "0000000211 4.4 1062.00\n0000000216 1.2 216.00\n0000000217 0.4 72.00\n");
  EXPECT_TRUE(propre());
  // Only leaving is left: validating again writes nothing more.
  EXPECT_EQ(jouer("press VALID"), "refused on VALID: VALID est inactif.");
  EXPECT_EQ(jouer("press TERMINE"), "ok");
  EXPECT_TRUE(m_->etat().fenetres.empty());
}

TEST_F(ImputerEcranTest, AnUnbalancedPieceIsNotLinkedAndAbandonPutsAllocationsBack) {
  proposer();
  size_t r = rang("CF26000001");
  jouer("select LST " + std::to_string(r));
  // Abandoned: the allocations are put back as they were accepted.
  jouer("press GERER_IMPUTATION");
  EXPECT_EQ(jouer("cell LSTV 1 LSTV_C5 1"), "ok");
  EXPECT_EQ(jouer("close"), "ok");
  jouer("press GERER_IMPUTATION");
  EXPECT_EQ(m_->etat().fenetres.back().listes.back().lignes[0][4], "4");
  // The first line left unbalanced while the second is current: the piece is in error.
  EXPECT_EQ(jouer("cell LSTV 1 LSTV_C5 1"), "ok");
  EXPECT_EQ(jouer("select LST 2"), "ok");
  std::string valide = jouer("press VALID");
  EXPECT_NE(valide.find("[117]"), std::string::npos) << valide;
  ASSERT_EQ(m_->etat().fenetres.back().ecran, "IMPUTER");
  const auto& liste = m_->etat().fenetres.back().listes.front();
  EXPECT_EQ(liste.lignes[r - 1][4], "N");
  EXPECT_EQ(liste.lignes[r - 1][5], "1");
  // A piece in error cannot be ticked again; the column takes only O and N.
  EXPECT_NE(jouer("cell LST " + std::to_string(r) + " LST_C5 O").find("[118]"), std::string::npos);
  EXPECT_EQ(jouer("cell LST " + std::to_string(r) + " LST_C5 X").rfind("refused", 0), 0u);
  jouer("press VALID");
  EXPECT_EQ(jouer("answer 1"), "ok");
  EXPECT_EQ(liens("CF26000001"), "");
  EXPECT_NE(liens("CF26000003"), "");
  EXPECT_TRUE(propre());
}

TEST_F(ImputerEcranTest, TheErrorListExportsForASpreadsheetAndTheDetailNeedsItsPiece) {
  // The pointing's waiting box goes by live, piece after piece.
  std::vector<std::string> vus;
  m_->suivreProgression([&vus](const std::optional<host::EtatProgression>& p) {
    if (p && p->total > 0)
      vus.push_back(p->titre + " " + std::to_string(p->fait) + "/" + std::to_string(p->total));
  });
  proposer();
  ASSERT_FALSE(vus.empty());
  EXPECT_EQ(vus.back(), "Traitement de la table GAPECOM 4/4");
  EXPECT_FALSE(m_->etat().progression);  // closed once the pointing ended
  t_.sql(R"(INSERT INTO "IMM_ERREUR" ("IDENT", "COMPOSANT", "CODE", "DESIG", "CMT")
            VALUES ('0000000901', 'GAPECOM', 'CF26000009', '=SOMME(A1:A9)', 'Montant ; 12,5'))");
  ASSERT_EQ(jouer("press AVANCER"), "ok");
  ASSERT_EQ(jouer("press RECULER"), "ok");  // back from P3: the lists are redrawn, not pointed
  EXPECT_EQ(jouer("press EXPORTER_LISTE_CSV"), "ok | dialog Exporter la liste:");
  auto file = t_.dir() / "erreurs.csv";
  EXPECT_EQ(jouer("answer " + file.string()), "ok");
  std::ifstream in(file);
  std::stringstream text;
  text << in.rdbuf();
  EXPECT_EQ(text.str(),
            "Erreur;Table;Pièce;Désignation;Commentaire\n"
            "0000000901;GAPECOM;CF26000009;'=SOMME(A1:A9);\"Montant ; 12,5\"\n");
  m_.reset();
  ModeleEcran autre(t_.session());
  EXPECT_EQ(autre.ouvrir("QUARVO-IMPUTER1", {"GAPECOM|0000009999"}),
            ModeleEcran::Ouverture::Refusee);
}

}  // namespace
}  // namespace quarvo
