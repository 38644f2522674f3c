#include <gtest/gtest.h>

#include "quarvo/import/ImportSupport.h"

namespace quarvo {
namespace {

using test::charger;
using test::lancer;
using test::ligne;
using test::requete;

TEST(ImportControlerTest, EveryFaultOfEveryRowIsWrittenAndRefusedPiecesLeaveTheStaging) {
  test::TestSession t(true);
  t.sql(
      R"(INSERT INTO "IMM_ERREUR" ("IDENT", "COMPOSANT", "CODE") VALUES ('0000000007', 'GAPEFAC', 'X');
           INSERT INTO "GCPARTIC" ("IDENT", "CODE", "DESIG", "GCPCRIT1_IDENT")
           VALUES ('0000000088', 'SANS-LIEN', 'Article sans regroupement', '0000000099'))");
  std::string file =
      test::enteteFf() +
      // a sound line, dated the last day of the company's month, and a comment line whose
      // VAT rate the regime lacks
      ligne({"FA26000001", "31/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "", "2",
             "180", "0", "20", "R1", "", "TECH01", "E-1", "F", "1"}) +
      ligne({"FA26000001", "31/12/2026", "ELECDIS", "AFF001", "", "", "Commentaire", "0", "0", "0",
             "7", "R1", "", "", "E-1", "F", "1"}) +
      // every fault at once, then a sound line of the same piece
      ligne({"FA26000002", "01/01/2027", "INCONNU", "AFF001", "BU-XX", "ARTX", "", "1", "10", "0",
             "19,6", "R2", "", "", "E-2", "F", "0"}) +
      ligne({"FA26000002", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "", "1",
             "180", "0", "20", "R2", "", "", "E-2", "F", "0"}) +
      ligne({"FA26000003", "15/12/2026", "ELECDIS", "AFF001", "", "SANS-LIEN", "", "1", "5", "0",
             "20", "R3", "", "", "E-3", "F", "1"}) +
      // not valid: a credit-note line is staged; valid or already a credit note: nothing
      ligne({"FA26000004", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "TABLEAU-ELEC", "", "1",
             "350", "0", "20", "R4", "", "", "E-4", "F", "0"}) +
      ligne({"AV26000005", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "TABLEAU-ELEC", "", "1",
             "350", "0", "20", "R5", "", "", "E-5", "A", "0"}) +
      ligne({"", "15/12/2026", "ELECDIS", "AFF009", "", "", "Sans numéro", "0", "0", "0", "0", "",
             "", "", "", "F", "1"});
  auto path = test::ecrireFichier(t, "ff.txt", file);
  ASSERT_EQ(charger(t, "IMM_PIECE_FF", path.string()), 0);
  EXPECT_EQ(lancer(t, "IMPORT_CONTROLER_FF"), 1);

  // The section refusals (rows 10 and 16) carry the project module's own reason.
  EXPECT_EQ(requete(t, R"(SELECT IDENT, COMPOSANT, CODE, DESIG,
                                CASE WHEN IDENT IN ('0000000010', '0000000016') THEN '<section>'
                                     ELSE CMT END
                           FROM "IMM_ERREUR" WHERE IDENT > '0000000007' ORDER BY IDENT)"),
            "0000000008|IMM_PIECE_FF|FA26000002|Facture fournisseur no FA26000002|Date de pièce "
            "supérieure au mois en cours\n"
            "0000000009|IMM_PIECE_FF|FA26000002|Facture fournisseur no FA26000002|Code "
            "fournisseur <INCONNU> inexistant\n"
            "0000000010|IMM_PIECE_FF|FA26000002|Facture fournisseur no FA26000002|<section>\n"
            "0000000011|IMM_PIECE_FF|FA26000002|Facture fournisseur no FA26000002|Code budget "
            "<BU-XX> inexistant\n"
            "0000000012|IMM_PIECE_FF|FA26000002|Facture fournisseur no FA26000002|Code article "
            "<ARTX> inexistant\n"
            "0000000013|IMM_PIECE_FF|FA26000002|Facture fournisseur no FA26000002|Taux de TVA "
            "<19.6> inexistant\n"
            "0000000014|IMM_PIECE_FF|FA26000003|Facture fournisseur no FA26000003|Code article "
            "<SANS-LIEN> : lien prestation inexistant\n"
            "0000000015|IMM_PIECE_FF||Facture fournisseur no |No de pièce non renseigné\n"
            "0000000016|IMM_PIECE_FF||Facture fournisseur no |<section>\n");
  EXPECT_NE(t.value("IMM_ERREUR", "CMT", "IDENT", "0000000010").find("AFF001"), std::string::npos);
  EXPECT_NE(t.value("IMM_ERREUR", "CMT", "IDENT", "0000000016").find("AFF009"), std::string::npos);
  // The refused pieces are gone, with every one of their lines; the credit-note line of the
  // invalid invoice FA26000004 was added.
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC, TYPE, VALIDE, LIGNE_FICHIER FROM "IMM_PIECE_FF"
                         ORDER BY IDENT)"),
            "FA26000001|F|1|2\n"
            "FA26000001|F|1|3\n"
            "FA26000004|F|0|7\n"
            "AV26000005|A|0|8\n"
            "AA26000004|A|0|7\n");
  EXPECT_EQ(t.ui().transcriptText(),
            "ATTENTE Traitement de la table IMM_PIECE_FF\n"
            "LIBELLE Etape 2 : contrôle avant import ...\n"
            "JAUGE 1/8\n"
            "JAUGE 8/8\n"
            "FIN ATTENTE\n");
}

TEST(ImportControlerTest, QuotesIgnoreBudgetsAndEarlierErrorsDoNotRefuseACorrectedFile) {
  test::TestSession t(true);
  // An error of an earlier run names piece DF1: the corrected file must still go through.
  t.sql(R"(INSERT INTO "IMM_ERREUR" VALUES ('0000000003', 'IMM_PIECE_DF', 'DF1',
             'Devis fournisseur no DF1', 'Code fournisseur <X> inexistant'))");
  std::string file =
      test::enteteAutre() + ligne({"DF1", "01/12/2026", "ELECDIS", "AFF001", "PAS-UN-BUDGET",
                                   "CABLE-3G2.5", "", "1", "180", "0", "20", "", "", "", "0"});
  auto path = test::ecrireFichier(t, "df.txt", file);
  ASSERT_EQ(charger(t, "IMM_PIECE_DF", path.string()), 0);
  EXPECT_EQ(lancer(t, "IMPORT_CONTROLER_DF"), 0);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_PIECE_DF")"), "1\n");
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_ERREUR")"), "1\n");

  // The same budget code in an order file is refused.
  std::string order =
      test::enteteAutre() + ligne({"CF1", "01/12/2026", "ELECDIS", "AFF001", "PAS-UN-BUDGET",
                                   "CABLE-3G2.5", "", "1", "180", "0", "20", "", "", "", "0"});
  auto orderPath = test::ecrireFichier(t, "cf.txt", order);
  ASSERT_EQ(charger(t, "IMM_PIECE_CF", orderPath.string()), 0);
  EXPECT_EQ(lancer(t, "IMPORT_CONTROLER_CF"), 1);
  EXPECT_EQ(requete(t, R"(SELECT IDENT, DESIG, CMT FROM "IMM_ERREUR" WHERE IDENT > '0000000003')"),
            "0000000004|Commande fournisseur no CF1|Code budget <PAS-UN-BUDGET> inexistant\n");
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_PIECE_CF")"), "0\n");
}

TEST(ImportControlerTest, CreditNoteLinesOfARefusedInvoiceGoWithIt) {
  test::TestSession t(true);
  // Line 1 is sound but not valid (its credit-note line is staged); line 2 of the same
  // invoice has an unknown article, so the invoice is refused, credit-note line included.
  std::string file = test::enteteFf() +
                     ligne({"FA26000009", "01/12/2026", "ELECDIS", "AFF001", "", "CABLE-3G2.5", "",
                            "1", "180", "0", "20", "", "", "", "", "F", "0"}) +
                     ligne({"FA26000009", "01/12/2026", "ELECDIS", "AFF001", "", "NOPE", "", "1",
                            "180", "0", "20", "", "", "", "", "F", "0"});
  auto path = test::ecrireFichier(t, "ff.txt", file);
  ASSERT_EQ(charger(t, "IMM_PIECE_FF", path.string()), 0);
  EXPECT_EQ(lancer(t, "IMPORT_CONTROLER_FF"), 1);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_PIECE_FF")"), "0\n");
}

}  // namespace
}  // namespace quarvo
