#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using namespace host;

struct Analysis {
  std::string erreur;  // P_ERREUR as handed back
  std::string rows;    // the error table, one row a line
  std::string shown;   // what the user saw
};

std::string errorRows(test::TestSession&) {
  Table t(nullptr, "VOVOVA", "IMM_ERREUR", "TEST");
  std::string out;
  while (t.lire(1) == 0) {
    out += t.valeur("IDENT").toChaine() + " " + t.valeur("COMPOSANT").toChaine() + " " +
           t.valeur("CODE").toChaine() + " | " + t.valeur("DESIG").toChaine() + " | " +
           t.valeur("CMT").toChaine() + "\n";
  }
  return out;
}

Analysis analyse(test::TestSession& t, const std::string& table, const std::string& ident,
                 const std::string& muet = "1") {
  Field erreur("VERREUR", "", "", 4, Kind::Entier, Valeur::entier(7), nullptr);
  EvtParamRef evt{val(table), val(ident), val(muet), val("OBJ"), ref(erreur)};
  t.ui().clear();
  t.session().appelerModule("QUARVO-ANALYSER", &evt);
  return {erreur.text(), errorRows(t), t.ui().transcriptText()};
}

// A piece of each kind, for tests that shape their own set-up.
void orderWithLines(test::TestSession& t, const std::string& header, const std::string& lines) {
  t.sql(R"(INSERT INTO "GAPECOM" ("IDENT", "NUMERO_DOC", "DATE_CREATION", "VALIDEE", "SECAN_CODE",
             "GCPFOUR_IDENT", "GCPREGM_IDENT", "TAUX_REMISE", "TAUX_ESCOMPTE", "PORT_HT", "FRAIS_HT")
           VALUES )" +
        header);
  t.sql(
      R"(INSERT INTO "GAPLCOM" ("IDENT", "NUMERO", "GCPARTIC_IDENT", "GCPARTIC_CODE", "SECAN_CODE",
             "GCPTVA_IDENT", "HT") VALUES )" +
      lines);
}

TEST(AnalyserTest, EveryDemoPieceAnalysesCleanly) {
  test::TestSession t(true);
  for (const auto& [table, ident] :
       std::vector<std::pair<std::string, std::string>>{{"GAPECOM", "0000000401"},
                                                        {"GAPECOM", "0000000402"},
                                                        {"GAPECOM", "0000000403"},
                                                        {"GAPECOM", "0000000404"},
                                                        {"GAPEBL", "0000000501"},
                                                        {"GAPEBL", "0000000502"},
                                                        {"GAPEFAC", "0000000601"},
                                                        {"GAPEFAC", "0000000602"},
                                                        {"GAPEFAC", "0000000603"},
                                                        {"GAPEFAC", "0000000604"}}) {
    Analysis r = analyse(t, table, ident, "0");
    EXPECT_EQ(r.erreur, "0") << table << " " << ident;
    EXPECT_EQ(r.rows, "") << table << " " << ident;
    EXPECT_EQ(r.shown, "") << table << " " << ident;
  }
}

TEST(AnalyserTest, ReportsEveryProblemOfAPieceNumberedAfterTheLastRow) {
  test::TestSession t(true);
  // An import error already in the table: numbering goes on after it.
  t.sql(R"(INSERT INTO "IMM_ERREUR" ("IDENT", "COMPOSANT", "CODE", "DESIG", "CMT")
           VALUES ('0000000041', 'IMM_PIECE_FF', 'X1', 'Facture fournisseur no X1', 'import'))");
  // No fees account; an item whose criterion has no purchase account; an account without
  // analytical post; a header section that names no project; a line section out of dates.
  t.sql(R"(DELETE FROM "GCPCOMPT" WHERE "CLE" = 'AFRAIS';
           UPDATE "AFCOMP" SET "CPOST" = NULL WHERE "IDENT" = '62420000';
           INSERT INTO "GCPCRIT1" ("IDENT", "CODE") VALUES ('0000000069', 'DIVERS');
           INSERT INTO "GCPARTIC" ("IDENT", "CODE", "GCPCRIT1_IDENT") VALUES ('0000000089', 'DIVERS', '0000000069'))");
  orderWithLines(
      t,
      R"(('0000000901', 'CF26000901', '2026-10-05', 1, 'AFF999', '0000000121',
                     '0000000091', 0, 0, '15.00', '20.00'))",
      R"(('0000000911', '0000000901|1', '0000000089', 'DIVERS', NULL, '0000000093', '10.00'),
                    ('0000000912', '0000000901|2', '0000000081', 'CABLE-3G2.5', 'AFF003', '0000000093', '180.00'),
                    ('0000000913', '0000000901|3', '0000000081', 'CABLE-3G2.5', NULL, '0000000093', '180.00'))");
  Analysis r = analyse(t, "GAPECOM", "0000000901", "0");
  EXPECT_EQ(r.erreur, "1");
  EXPECT_EQ(r.rows,
            "0000000041 IMM_PIECE_FF X1 | Facture fournisseur no X1 | import\n"
            "0000000042 GAPECOM CF26000901 | Pièce CF26000901 : section analytique AFF999 | "
            "Aucune affaire ne porte le code <AFF999> !\n"
            "0000000043 GAPECOM CF26000901 | Commande fournisseur n° CF26000901 | "
            "Compte d'achat non défini pour l'article <DIVERS> !\n"
            "0000000044 GAPECOM CF26000901 | Commande fournisseur n° CF26000901 | "
            "Poste analytique non défini pour le compte <> !\n"
            "0000000045 GAPECOM CF26000901 | Pièce CF26000901 : section analytique AFF003 | "
            "La date de la pièce (05/10/2026) dépasse la fin de l'affaire <AFF003> (30/09/2026) !\n"
            "0000000046 GAPECOM CF26000901 | Commande fournisseur n° CF26000901 | "
            "Compte de frais non défini !\n"
            "0000000047 GAPECOM CF26000901 | Commande fournisseur n° CF26000901 | "
            "Poste analytique non défini pour le compte <> !\n"
            "0000000048 GAPECOM CF26000901 | Commande fournisseur n° CF26000901 | "
            "Poste analytique non défini pour le compte <62420000> !\n");
  // One "Attention" box per row written, its text the designation and comment joined by "@".
  EXPECT_EQ(r.shown,
            "MESSAGE Attention | Pièce CF26000901 : section analytique AFF999@Aucune affaire ne "
            "porte le code <AFF999> ! | [OK]\n"
            "MESSAGE Attention | Commande fournisseur n° CF26000901@Compte d'achat non défini "
            "pour l'article <DIVERS> ! | [OK]\n"
            "MESSAGE Attention | Commande fournisseur n° CF26000901@Poste analytique non défini "
            "pour le compte <> ! | [OK]\n"
            "MESSAGE Attention | Pièce CF26000901 : section analytique AFF003@La date de la pièce "
            "(05/10/2026) dépasse la fin de l'affaire <AFF003> (30/09/2026) ! | [OK]\n"
            "MESSAGE Attention | Commande fournisseur n° CF26000901@Compte de frais non défini ! "
            "| [OK]\n"
            "MESSAGE Attention | Commande fournisseur n° CF26000901@Poste analytique non défini "
            "pour le compte <> ! | [OK]\n"
            "MESSAGE Attention | Commande fournisseur n° CF26000901@Poste analytique non défini "
            "pour le compte <62420000> ! | [OK]\n");

  // A second, silent analysis goes on numbering and shows nothing.
  Analysis again = analyse(t, "GAPECOM", "0000000901", "1");
  EXPECT_EQ(again.erreur, "1");
  EXPECT_EQ(again.shown, "");
  EXPECT_NE(again.rows.find("0000000055 GAPECOM"), std::string::npos) << again.rows;
  EXPECT_EQ(again.rows.find("0000000056"), std::string::npos) << again.rows;
}

TEST(AnalyserTest, LinesThatCarryNoAmountAreNotChecked) {
  test::TestSession t(true);
  t.sql(
      R"(INSERT INTO "GCPARTIC" ("IDENT", "CODE", "GCPCRIT1_IDENT") VALUES ('0000000089', 'SANSCPT', '0000000069'))");
  // Line 1: no item code; line 2: zero amount; line 3: 100 % header discount leaves nothing.
  orderWithLines(t,
                 R"(('0000000901', 'CF26000901', '2026-05-05', 1, NULL, '0000000121',
                     '0000000091', 100, 0, '0.00', '0.00'))",
                 R"(('0000000911', '0000000901|1', '0000000089', NULL, NULL, '0000000093', '10.00'),
                    ('0000000912', '0000000901|2', '0000000089', 'SANSCPT', NULL, '0000000093', '0.00'),
                    ('0000000913', '0000000901|3', '0000000089', 'SANSCPT', NULL, '0000000093', '250.00'))");
  Analysis r = analyse(t, "GAPECOM", "0000000901");
  EXPECT_EQ(r.erreur, "0");
  EXPECT_EQ(r.rows, "");
  // With a discount that leaves an amount, the same line is checked.
  t.sql(R"(UPDATE "GAPECOM" SET "TAUX_REMISE" = 99.99 WHERE "IDENT" = '0000000901')");
  r = analyse(t, "GAPECOM", "0000000901");
  EXPECT_EQ(r.erreur, "1");
  EXPECT_NE(r.rows.find("Compte d'achat non défini pour l'article <SANSCPT> !"), std::string::npos);
}

TEST(AnalyserTest, GroupingModeChoosesTheCriterionOfTheAccount) {
  test::TestSession t(true);
  // Mode 0: the supplier's family. ELECDIS is a trader: account 60700000 for any item.
  t.sql(R"(UPDATE "GCPCOMPT" SET "VALEUR" = '0' WHERE "CLE" = 'MACHAT';
           INSERT INTO "GCPARTIC" ("IDENT", "CODE", "GCPCRIT1_IDENT") VALUES ('0000000089', 'DIVERS', '0000000069'))");
  orderWithLines(
      t,
      R"(('0000000901', 'CF26000901', '2026-05-05', 1, NULL, '0000000121',
                     '0000000091', 0, 0, '0.00', '0.00'))",
      R"(('0000000911', '0000000901|1', '0000000089', 'DIVERS', NULL, '0000000093', '10.00'))");
  EXPECT_EQ(analyse(t, "GAPECOM", "0000000901").rows, "");
  // Mode 4 (above 3): the criterion is empty; only a row without criterion can answer.
  t.sql(R"(UPDATE "GCPCOMPT" SET "VALEUR" = '4' WHERE "CLE" = 'MACHAT')");
  Analysis r = analyse(t, "GAPECOM", "0000000901");
  EXPECT_EQ(r.erreur, "1");
  EXPECT_NE(r.rows.find("pour l'article <DIVERS> !"), std::string::npos);
  t.sql(R"(DELETE FROM "IMM_ERREUR";
           INSERT INTO "GCPCPTACH" ("IDENT", "CRITERE_IDENT", "GCPREGM_IDENT", "COMPTE")
           VALUES ('0000000159', NULL, '0000000091', '60700000'))");
  r = analyse(t, "GAPECOM", "0000000901");
  EXPECT_EQ(r.erreur, "0");
  EXPECT_EQ(r.rows, "");
}

TEST(AnalyserTest, PiecesThatCannotBeAnalysedLeaveNoTrace) {
  test::TestSession t(true);
  for (const auto& [table, ident] : std::vector<std::pair<std::string, std::string>>{
           {"GAPEDEV", "0000000301"}, {"QUARVO", "0000000401"}, {"GAPECOM", "0000009999"}}) {
    Analysis r = analyse(t, table, ident, "0");
    EXPECT_EQ(r.erreur, "0") << table;
    EXPECT_EQ(r.rows, "") << table;
    EXPECT_EQ(r.shown, "") << table;
  }
}

TEST(AnalyserTest, PurchasesJournalComesFromTheAccountingLinkInUse) {
  test::TestSession t(true);
  // Integrated accounting without a purchases journal: one row, the analysis stops, and the
  // caller learns the piece cannot be carried into the accounting.
  t.sql(R"(INSERT INTO "IMM_ERREUR" ("IDENT", "COMPOSANT") VALUES ('0000000007', 'IMM_PIECE_CF');
           DELETE FROM "GCPCOMPT" WHERE "GENRE" = 'J';
           UPDATE "AFCOMP" SET "CPOST" = NULL)");
  Analysis r = analyse(t, "GAPECOM", "0000000401", "0");
  EXPECT_EQ(r.erreur, "1");
  EXPECT_EQ(r.rows,
            "0000000007 IMM_PIECE_CF  |  | \n"
            "0000000008 GCPCOMPT JL_ACHAT | Paramètrage de la liaison comptable | Journal des "
            "achats non défini !\n");
  EXPECT_EQ(r.shown,
            "MESSAGE Attention | Paramètrage de la liaison comptable@Journal des achats non "
            "défini ! | [OK]\n");

  // The accounting is declared linked but not set up: the file-transfer configuration answers.
  t.sql(R"(DELETE FROM "IMM_ERREUR"; DELETE FROM "CPPARAM";
           UPDATE "AFCOMP" SET "CPOST" = 'ACH-MAT')");
  EXPECT_EQ(analyse(t, "GAPECOM", "0000000402").rows, "");
  t.sql(R"(DELETE FROM "GCPTCFG" WHERE "CLE" = 'APORT')");
  r = analyse(t, "GAPECOM", "0000000402");  // 60.00 carriage
  EXPECT_NE(r.rows.find("Compte de port non défini !"), std::string::npos) << r.rows;

  // No accounting link and no journal configured: the journal is "60" and the analysis goes on.
  t.sql(R"(DELETE FROM "IMM_ERREUR"; DELETE FROM "GCPTCFG" WHERE "GENRE" = 'J';
           UPDATE "AFSOCI" SET "LIAISON_C" = 'N')");
  r = analyse(t, "GAPECOM", "0000000401");
  EXPECT_EQ(r.erreur, "0");
  EXPECT_EQ(r.rows, "");
}

}  // namespace
}  // namespace quarvo
