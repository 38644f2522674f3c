// The cancellation selection worked as a controller works it: through the action interface, on
// the demo company once its pieces are linked, with the link rows and the budget lines' figures
// checked after.
#include <gtest/gtest.h>

#include <optional>
#include <sstream>

#include "app/FiguresCommand.h"
#include "host/event/Evt.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"
#include "support/Audit.h"
#include "support/Ecrans.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using host::ModeleEcran;
using host::Table;
using host::Valeur;

class AnnulerTest : public ::testing::Test {
 protected:
  void SetUp() override {
    ASSERT_NO_FATAL_FAILURE(test::imputerUneCommandeSurDeuxLignes(t_));
    ASSERT_EQ(liens("CF26000001"), "0000000211 720.00, 0000000212 630.00");
  }
  void ouvrir() {
    m_ = std::make_unique<ModeleEcran>(t_.session(), &t_.ui());
    ASSERT_EQ(m_->ouvrir("QUARVO-ANNULER"), ModeleEcran::Ouverture::Ouverte);
  }
  std::string jouer(const std::string& line) { return test::jouer(*m_, line); }
  std::string champ(const std::string& field) { return test::champ(*m_, field); }
  bool actif(const std::string& control) { return test::actif(*m_, control); }
  std::string onglet() { return m_->etat().fenetres.back().onglet; }
  // The list as it is shown: one line per piece, its five columns.
  std::string liste() {
    std::string out;
    for (const auto& l : m_->etat().fenetres.back().listes) {
      for (const auto& row : l.lignes) {
        for (size_t i = 0; i < row.size(); ++i) out += (i == 0 ? "" : " ") + row[i];
        out += "\n";
      }
    }
    return out;
  }
  // The list built from the selection typed: "AVANCER", then "yes" to message 432.
  void lister() {
    ASSERT_EQ(jouer("press AVANCER"), "ok | dialog Question: Oui Non");
    ASSERT_EQ(jouer("answer Oui"), "ok");
    ASSERT_EQ(onglet(), "P2");
  }
  // The budget lines a piece is linked to, with the amount of each link.
  std::string liens(const std::string& piece) {
    Table t(nullptr, "VOVOVA", "QUARVO", "TEST");
    t.ajouterCritere("PIECE", '=', Valeur::chaine(piece));
    std::string out;
    while (t.lire(1) == 0) {
      out += (out.empty() ? "" : ", ") + t.valeur("AFLBUD_IDENT").toChaine() + " " +
             t.valeur("HT").toChaine();
    }
    return out;
  }
  int64_t lignes(const std::string& table) {
    Table t(nullptr, "VOVOVA", table, "TEST");
    return t.compter();
  }
  std::string engage(const std::string& line) { return t_.value("AFLBUD", "VENG", "IDENT", line); }
  ::testing::AssertionResult propre() { return test::sansEcart(t_.session()); }

  test::TestSession t_{true};
  std::unique_ptr<ModeleEcran> m_;
};

TEST_F(AnnulerTest, TheSecondTabIsReachedOnlyByAConfirmedAdvance) {
  ouvrir();
  EXPECT_EQ(onglet(), "P1");
  EXPECT_EQ(champ("VDATEMIN"), "");
  EXPECT_EQ(champ("VDATEMAX"), "31/12/2026");  // the company's current month
  EXPECT_NE(champ("VEXPLICATIONS").find("DOVERUVA/FICSTAND/MEMO2.TXT"), std::string::npos);
  EXPECT_FALSE(actif("RECULER") || actif("VALID") || actif("TERMINE"));
  EXPECT_EQ(jouer("tab P2"), "refused on ONGLET: ONGLET est inactif.");
  EXPECT_EQ(jouer("press BORNE7"), "ok");  // the fiscal year
  EXPECT_EQ(champ("VDATEMIN") + "-" + champ("VDATEMAX"), "01/01/2026-31/12/2026");

  // One project asked for, none given: message 438, back to the project choice.
  EXPECT_EQ(jouer("set VAFFA_TOUTES U"), "ok");
  EXPECT_EQ(jouer("press AVANCER"),
            "refused on VAFFA_TOUTES: [438] Vous avez choisi une seule affaire : indiquez son "
            "code. | [438] Vous avez choisi une seule affaire : indiquez son code.");
  EXPECT_EQ(onglet(), "P1");
  EXPECT_EQ(jouer("set VAFFA_CODE AFF002"), "ok");
  EXPECT_EQ(jouer("set VAFFA_TOUTES T"), "ok");
  EXPECT_EQ(champ("VAFFA_CODE"), "");  // all projects: the code goes

  // A "no" to message 432: the tab stays, nothing is listed, the work table is not touched.
  int64_t travail = lignes("M_EAPPR");  // what the imputation left there
  EXPECT_EQ(jouer("press AVANCER"), "ok | dialog Question: Oui Non");
  EXPECT_EQ(jouer("answer Non"), "refused on AVANCER: La fenêtre a refusé press AVANCER.");
  EXPECT_EQ(onglet(), "P1");
  EXPECT_EQ(lignes("M_EAPPR"), travail);
  EXPECT_TRUE(actif("AVANCER") && actif("VDATEMIN") && !actif("VALID"));
}

TEST_F(AnnulerTest, DoesNotOpenOverTheImputationWhoseProposalItWouldWipeOut) {
  m_ = std::make_unique<ModeleEcran>(t_.session(), &t_.ui());
  ASSERT_EQ(m_->ouvrir("QUARVO-IMPUTER"), ModeleEcran::Ouverture::Ouverte);
  EXPECT_EQ(m_->ouvrir("QUARVO-ANNULER"), ModeleEcran::Ouverture::Refusee);
  ASSERT_TRUE(m_->etat().refus);
  EXPECT_EQ(m_->etat().refus->texte.rfind("[19] ", 0), 0u) << m_->etat().refus->texte;
  EXPECT_EQ(m_->etat().fenetres.back().ecran, "IMPUTER");
}

TEST_F(AnnulerTest, ListsEveryLinkedPieceOnceWhileTheWaitingBoxShowsProgress) {
  // Invoice FF26000002 loses its links: it is not listed.
  host::EvtParamVal piece{host::val("GAPEFAC"), host::val("0000000602")};
  ASSERT_EQ(t_.session().appelerModule("QUARVO-ANNULER1", &piece), 0);
  ouvrir();
  t_.ui().clear();
  lister();
  EXPECT_EQ(liste(),
            "GAPEBL BR26000001 20/03/2026 1350.00 O\n"
            "GAPEBL BR26000002 25/04/2026 950.00 O\n"
            "GAPECOM CF26000001 02/03/2026 1350.00 O\n"  // two links, one row
            "GAPECOM CF26000002 10/04/2026 1260.00 O\n"
            "GAPECOM CF26000003 05/05/2026 3600.00 O\n"
            "GAPECOM CF26000004 01/06/2026 360.00 O\n"
            "GAPEFAC AV26000001 15/04/2026 -315.00 O\n"  // a credit note counts negatively
            "GAPEFAC FF26000001 31/03/2026 1350.00 O\n"
            "GAPEFAC FF26000003 30/04/2026 950.00 O\n");
  // Orders, then receipts, then invoices, each kind with its own box, each piece as it is read.
  EXPECT_EQ(t_.ui().transcriptText(),
            "ATTENTE Traitement de la table GAPECOM\nLIBELLE No commande : CF26000001\n"
            "JAUGE 1/4\nLIBELLE No commande : CF26000002\nLIBELLE No commande : CF26000003\n"
            "LIBELLE No commande : CF26000004\nJAUGE 4/4\nFIN ATTENTE\n"
            "ATTENTE Traitement de la table GAPEBL\nLIBELLE No bon de réception : BR26000001\n"
            "JAUGE 1/2\nLIBELLE No bon de réception : BR26000002\nJAUGE 2/2\nFIN ATTENTE\n"
            "ATTENTE Traitement de la table GAPEFAC\nLIBELLE No facture : FF26000001\n"
            "JAUGE 1/4\nLIBELLE No facture : FF26000002\nLIBELLE No facture : AV26000001\n"
            "LIBELLE No facture : FF26000003\nJAUGE 4/4\nFIN ATTENTE\n");
  EXPECT_FALSE(m_->etat().progression);
  EXPECT_FALSE(actif("AVANCER") || actif("TERMINE") || actif("VDATEMIN") || actif("BORNE1"));
  EXPECT_TRUE(actif("RECULER") && actif("VALID"));

  EXPECT_EQ(jouer("select LST 7"), "ok");
  EXPECT_EQ(champ("VPIECE"), "A AV26000001");
  EXPECT_EQ(jouer("select LST 3"), "ok");
  EXPECT_EQ(champ("VPIECE"), "BC CF26000001");

  // Back to the selection, narrowed, and forward again: the list is built anew.
  EXPECT_EQ(jouer("press RECULER"), "ok");
  EXPECT_EQ(onglet(), "P1");
  EXPECT_TRUE(actif("VDATEMIN") && actif("AVANCER") && !actif("VALID"));
  EXPECT_EQ(jouer("set VTYPE_PIECE Commandes"), "ok");
  EXPECT_EQ(jouer("set VNUMMIN CF26000002"), "ok");
  EXPECT_EQ(jouer("set VNUMMAX CF26000003"), "ok");
  lister();
  EXPECT_EQ(liste(),
            "GAPECOM CF26000002 10/04/2026 1260.00 O\n"
            "GAPECOM CF26000003 05/05/2026 3600.00 O\n");
}

TEST_F(AnnulerTest, APeriodAndAProjectNarrowTheListAndClosingEmptiesIt) {
  // A piece dated after the current month is beyond the default end date, not beyond none.
  t_.sql(R"(UPDATE "GAPECOM" SET "DATE_CREATION" = '2027-01-04' WHERE "IDENT" = '0000000404')");
  ouvrir();
  EXPECT_EQ(jouer("set VTYPE_PIECE C"), "ok");
  lister();
  EXPECT_EQ(liste().find("CF26000004"), std::string::npos);
  jouer("press RECULER");
  EXPECT_EQ(jouer("set VDATEMAX "), "ok");
  lister();
  EXPECT_NE(liste().find("GAPECOM CF26000004 04/01/2027 360.00 O"), std::string::npos);

  // April, one project: a header without section belongs to the project of one of its lines;
  // a header's own section decides whatever the lines say.
  t_.sql(R"(UPDATE "GAPLFAC" SET "SECAN_CODE" = 'AFF002' WHERE "NUMERO" = '0000000603|1')");
  jouer("press RECULER");
  EXPECT_EQ(jouer("set VTYPE_PIECE T"), "ok");
  EXPECT_EQ(jouer("set VDATEMIN 01/04/2026"), "ok");
  EXPECT_EQ(jouer("set VDATEMAX 30/04/2026"), "ok");
  EXPECT_EQ(jouer("set VAFFA_TOUTES U"), "ok");
  EXPECT_EQ(jouer("set VAFFA_CODE AFF002"), "ok");
  lister();
  EXPECT_EQ(liste(),
            "GAPEBL BR26000002 25/04/2026 950.00 O\n"
            "GAPECOM CF26000002 10/04/2026 1260.00 O\n"
            "GAPEFAC FF26000003 30/04/2026 950.00 O\n");

  // Closed: the list goes with the window; the errors of other work stay where they are.
  t_.sql(R"(INSERT INTO "IMM_ERREUR" ("IDENT", "COMPOSANT", "CODE", "CMT")
            VALUES ('0000000001', 'IMM_PIECE_CF', 'CF26000009', 'un défaut de l''import'))");
  EXPECT_EQ(jouer("close"), "ok");
  EXPECT_TRUE(m_->etat().fenetres.empty());
  EXPECT_EQ(lignes("M_EAPPR"), 0);
  EXPECT_EQ(lignes("IMM_ERREUR"), 1);
  EXPECT_EQ(liens("BR26000002"), "0000000221 950.00");  // nothing cancelled
}

TEST_F(AnnulerTest, TheMarkedPiecesLoseTheirLinksAndTheirLinesTheirFigures) {
  ouvrir();
  EXPECT_EQ(jouer("set VTYPE_PIECE C"), "ok");
  lister();
  ASSERT_EQ(liste(),
            "GAPECOM CF26000001 02/03/2026 1350.00 O\n"
            "GAPECOM CF26000002 10/04/2026 1260.00 O\n"
            "GAPECOM CF26000003 05/05/2026 3600.00 O\n"
            "GAPECOM CF26000004 01/06/2026 360.00 O\n");
  ASSERT_EQ(engage("0000000211") + " " + engage("0000000212"), "720.00 630.00");

  // The fifth column takes "O" or "N" only; a refused mark keeps the one before.
  EXPECT_EQ(jouer("cell LST 2 LST_C5 X"),
            "refused on LST_C5: Tapez O pour annuler les imputations de la pièce, N pour les "
            "garder. | Tapez O pour annuler les imputations de la pièce, N pour les garder.");
  EXPECT_EQ(liste().find(" N\n"), std::string::npos);
  EXPECT_EQ(jouer("cell LST 2 LST_C5 N"), "ok");
  EXPECT_EQ(jouer("cell LST 4 LST_C5 N"), "ok");
  EXPECT_EQ(liste(),
            "GAPECOM CF26000001 02/03/2026 1350.00 O\n"
            "GAPECOM CF26000002 10/04/2026 1260.00 N\n"
            "GAPECOM CF26000003 05/05/2026 3600.00 O\n"
            "GAPECOM CF26000004 01/06/2026 360.00 N\n");

  // A "no" to message 86 cancels nothing.
  EXPECT_EQ(jouer("press VALID"), "ok | dialog Question: Oui Non");
  EXPECT_EQ(jouer("answer Non"), "refused on VALID: La fenêtre a refusé press VALID.");
  EXPECT_EQ(liens("CF26000001"), "0000000211 720.00, 0000000212 630.00");

  EXPECT_EQ(jouer("press VALID"), "ok | dialog Question: Oui Non");
  EXPECT_EQ(jouer("answer Oui"), "ok");
  EXPECT_EQ(liens("CF26000001"), "");  // both lines of the piece
  EXPECT_EQ(liens("CF26000003"), "");
  EXPECT_EQ(liens("CF26000002"), "0000000221 1260.00");  // unmarked pieces keep theirs
  EXPECT_EQ(liens("CF26000004"), "0000000234 360.00");
  EXPECT_EQ(liens("BR26000001"), "0000000211 1350.00");  // another kind, not selected
  EXPECT_EQ(engage("0000000211") + " " + engage("0000000212") + " " + engage("0000000213"),
            "0.00 0.00 0.00");
  EXPECT_EQ(engage("0000000221"), "1260.00");
  EXPECT_TRUE(propre());

  // Done: leaving is all that is left, and nothing of the list outlives the window.
  EXPECT_FALSE(actif("VALID") || actif("RECULER") || actif("ABAND"));
  EXPECT_EQ(jouer("cell LST 1 LST_C5 N"), "refused on LST: LST est inactif.");
  EXPECT_EQ(jouer("press TERMINE"), "ok");
  EXPECT_TRUE(m_->etat().fenetres.empty());
  EXPECT_EQ(lignes("M_EAPPR"), 0);
}

}  // namespace
}  // namespace quarvo
