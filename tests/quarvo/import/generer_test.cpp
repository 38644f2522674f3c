#include <gtest/gtest.h>

#include "quarvo/import/ImportSupport.h"

namespace quarvo {
namespace {

using test::charger;
using test::lancer;
using test::ligne;
using test::requete;

// Loads, controls and generates `file` of kind `kind` ("FF", "CF", ...): the control's flag.
int importer(test::TestSession& t, const std::string& kind, const std::string& file) {
  auto path = test::ecrireFichier(t, kind + ".txt", file);
  EXPECT_EQ(charger(t, "IMM_PIECE_" + kind, path.string()), 0);
  int control = lancer(t, "IMPORT_CONTROLER_" + kind);
  EXPECT_EQ(lancer(t, "IMPORT_GENERER_" + kind), 0);
  return control;
}

std::string factures() {
  return test::enteteFf() +
         ligne({"FA26000001", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "2", "180", "0", "20", "Câblage", "BR1", "TECH01", "EDC-77", "F", "1"}) +
         ligne({"FA26000001", "15/12/2026", "ELECDIS", "AFF001", "BU26-0001", "TABLEAU-ELEC",
                "Tableau posé", "1", "350", "10", "20", "Câblage", "BR1", "TECH01", "EDC-77", "F",
                "1"}) +
         ligne({"FA26000001", "15/12/2026", "ELECDIS", "AFF001", "", "", "Livré le 14/12", "0", "0",
                "0", "0", "Câblage", "BR1", "TECH01", "EDC-77", "F", "1"}) +
         ligne({"AV26000002", "16/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "",
                "1", "180", "0", "20", "Retour", "", "", "EDC-A-9", "A", "1"});
}

TEST(ImportGenererTest, InvoicesAndCreditNotesAreCreatedBookedAndLinkedOnce) {
  test::TestSession t(true);
  EXPECT_EQ(importer(t, "FF", factures()), 0);
  EXPECT_EQ(requete(t, R"(SELECT IDENT, NUMERO_DOC, NUMERO, DESIG, ORIGINE, TYPE, VALIDEE,
                                GCPFOUR_IDENT, GCPREG_IDENT, GAPAPPOR_IDENT, BRUT, HT, TTC,
                                NET_A_PAYER, QTNT
                           FROM "GAPEFAC" WHERE IDENT > '0000001000' ORDER BY IDENT)"),
            "0000001001|AV26000002|EDC-A-9|Retour||A|1|0000000121|0000000115||180.00|180.00|"
            "216.00|216.00|1.0\n"
            "0000001002|FA26000001|EDC-77|Câblage|BR1|F|1|0000000121|0000000115|0000000135|"
            "675.00|675.00|810.00|810.00|3.0\n");
  EXPECT_EQ(requete(t, R"(SELECT NUMERO, STYLE, GCPARTIC_CODE, DESIG, SECAN_CODE, GCPDEPOT_IDENT,
                                GCPTVA_IDENT, QTE, PUHT, BRUT, HT
                           FROM "GAPLFAC" WHERE IDENT > '0000001000' ORDER BY IDENT)"),
            "0000001001|1|0|CABLE-3G2.5|Câble électrique 3G2,5 mm² (couronne de 100 m)|AFF001|"
            "0000000191|0000000093|1.0|180.00|180.00|180.00\n"
            "0000001002|1|0|CABLE-3G2.5|Câble électrique 3G2,5 mm² (couronne de 100 m)|AFF001|"
            "0000000191|0000000093|2.0|180.00|360.00|360.00\n"
            "0000001002|2|0|TABLEAU-ELEC|Tableau posé|AFF001|0000000191|0000000093|1.0|350.00|"
            "350.00|315.00\n"
            "0000001002|3|2||Livré le 14/12||||0.0|0.00|0.00|0.00\n");
  // Two lines of one service: one link row, at their net amount (360.00 + 350.00 less 10 %);
  // the credit note books negatively.
  EXPECT_EQ(requete(t, R"(SELECT AFEBUD_IDENT, AFAFFA_CODE, AFLBUD_IDENT, COMPOSANT,
                                COMPOSANT_IDENT, PIECE, DATE_PIECE, QTE, HT, CLE_COMPO
                           FROM "QUARVO" ORDER BY IDENT)"),
            "0000000201|AFF001|0000000211|GAPEFAC|0000001001|AV26000002|2026-12-16|-1.0|-180.00|"
            "0000000211|GAPEFAC|AV26000002\n"
            "0000000201|AFF001|0000000211|GAPEFAC|0000001002|FA26000001|2026-12-15|3.0|675.00|"
            "0000000211|GAPEFAC|FA26000001\n");
  EXPECT_EQ(
      requete(t, R"(SELECT VREA, VRAF, round(AVT, 4) FROM "AFLBUD" WHERE IDENT = '0000000211')"),
      "495.00;495.00;495.00|5505.00;5505.00;5505.00|8.25\n");
  EXPECT_EQ(requete(t, R"(SELECT GAPEFAC_IDENT, NUMERO_DOC, DATE_ECHEANCE, MONTANT FROM "GAPECH"
                           WHERE IDENT > '0000001000' ORDER BY GAPEFAC_IDENT)"),
            "0000001001|AV26000002|2027-01-31|216.00\n"
            "0000001002|FA26000001|2027-01-31|810.00\n");
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "AFMOUV" WHERE COMPOSANT = 'GAPEFAC')"), "2\n");

  // The same file again: nothing new, no figure moves.
  std::string before = requete(t, R"(SELECT * FROM "AFLBUD" ORDER BY IDENT)") +
                       requete(t, R"(SELECT * FROM "QUARVO" ORDER BY IDENT)");
  t.ui().clear();
  EXPECT_EQ(importer(t, "FF", factures()), 0);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPEFAC" WHERE IDENT > '0000001000')"), "2\n");
  EXPECT_EQ(requete(t, R"(SELECT * FROM "AFLBUD" ORDER BY IDENT)") +
                requete(t, R"(SELECT * FROM "QUARVO" ORDER BY IDENT)"),
            before);
  EXPECT_EQ(t.ui().transcriptText().find("MESSAGE"), std::string::npos);
}

TEST(ImportGenererTest, RealisedBeyondBudgetAndNewBudgetLines) {
  test::TestSession t(true);
  std::string file =
      test::enteteFf() +
      // 11 days at 180.00 on a line budgeted 1 800.00: nothing remains, progress is 100 %.
      ligne({"FA26100009", "10/12/2026", "LOCAPRO", "AFF001", "BU26-0001", "NACELLE-JOUR", "", "11",
             "180", "0", "20", "", "", "", "", "F", "1"}) +
      // A service the budget lacks: a line is created, budgeted 0, with progress 0.
      ligne({"FA26100010", "10/12/2026", "ELECDIS", "AFF001", "BU26-0001", "ETUDE-THERM", "", "1",
             "4000", "0", "20", "", "", "", "", "F", "1"});
  EXPECT_EQ(importer(t, "FF", file), 0);
  EXPECT_EQ(requete(t, R"(SELECT IDENT, NUMERO, AFEBUD_IDENT, DESIG, AFPRES_CODE, UNITE, APPRO,
                                AFEBUD_PIECE, DATE_DEBUT, VBUD_D, VREA, VRAF, AVT
                           FROM "AFLBUD" WHERE IDENT IN ('0000000214') OR IDENT > '0000001000'
                           ORDER BY IDENT)"),
            "0000000214|0000000201|4|0000000201|Location de nacelle élévatrice|LOC-ENG|J|A|"
            "BU26-0001|2026-01-15|1800.00|1980.00;1980.00;1980.00|0.00;0.00;0.00|100.0\n"
            "0000001001|0000000201||0000000201|Études externes|ETU-EXT|F|A|BU26-0001|2026-01-15|"
            "0.00|4000.00;4000.00;4000.00|0.00;0.00;0.00|0.0\n");
  // The results of the purchase post were recomputed for the company's month.
  EXPECT_EQ(requete(t, R"(SELECT AFPOST_CODE, ANNEE_MOIS, VREA FROM "AFRESU"
                           WHERE AFAFFA_IDENT = '0000000011' ORDER BY AFPOST_CODE)"),
            "ACH-ETU|202612|4000.00\nACH-LOC|202612|1980.00\n");
}

TEST(ImportGenererTest, OrdersReceiptsAndQuotesBookSettleAndCreateTheirRequester) {
  test::TestSession t(true);
  t.sql(R"(INSERT INTO "AFPERS" ("IDENT", "CODE", "NOM", "PRENOM", "CIVILITE", "AFSERV_IDENT")
           VALUES ('0000000132', 'PMARTIN', 'Martin', 'Paul', 'M', '0000000032'))");
  std::string commandes =
      test::enteteAutre() +
      ligne({"CF26100001", "05/12/2026", "HYDROSAN", "AFF001", "BU26-0001", "ROBINET-EQ", "", "5",
             "12,5", "0", "20", "Robinets", "", "PMARTIN", "1"}) +
      ligne({"CF26100002", "06/12/2026", "ELECDIS", "AFF001", "BU26-0001", "CABLE-3G2.5", "", "2",
             "180", "0", "20", "Câble", "", "TECH01", "0"});
  EXPECT_EQ(importer(t, "CF", commandes), 0);
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC, DESIG, SOLDEE, QTNT, HT, MTNT_HT, GAPAPPOR_IDENT
                           FROM "GAPECOM" WHERE IDENT > '0000001000' ORDER BY NUMERO_DOC)"),
            "CF26100001|Robinets|1|0.0|62.50|0.00|0000001001\n"
            "CF26100002|Câble|0|2.0|360.00|0.00|0000000135\n");
  EXPECT_EQ(requete(t, R"(SELECT CODE, NOM, PRENOM, CIVILITE, SERVICE FROM "GAPAPPOR"
                           WHERE IDENT = '0000001001')"),
            "PMARTIN|Martin|Paul|Monsieur|Bureau d'études\n");
  EXPECT_EQ(requete(t, R"(SELECT QTE, QTE_SOLDEE FROM "GAPLCOM" WHERE IDENT > '0000001000'
                           ORDER BY IDENT)"),
            "5.0|5.0\n2.0|0.0\n");
  EXPECT_EQ(requete(t, R"(SELECT QTE_ATTENDUE FROM "GCPSTOCK" WHERE IDENT = '0000000196')"),
            "15.0\n");
  // The settled order has nothing left to commit: linked to nothing, as the pointing would.
  EXPECT_EQ(
      requete(t, R"(SELECT IDENT, VENG FROM "AFLBUD" WHERE IDENT IN ('0000000211', '0000000212')
                           ORDER BY IDENT)"),
      "0000000211|360.00\n0000000212|0.00\n");
  EXPECT_EQ(requete(t, R"(SELECT PIECE, HT FROM "QUARVO" WHERE COMPOSANT = 'GAPECOM')"),
            "CF26100002|360.00\n");
  EXPECT_EQ(requete(t, R"(SELECT AFPOST_CODE, ANNEE_MOIS, VENG FROM "AFRESU" ORDER BY ANNEE_MOIS)"),
            "ACH-MAT|202612|360.00\n");

  std::string receptions =
      test::enteteAutre() + ligne({"BR26100001", "07/12/2026", "LOCAPRO", "AFF001", "BU26-0001",
                                   "NACELLE-JOUR", "", "2", "180", "0", "20", "", "", "", "0"});
  EXPECT_EQ(importer(t, "BF", receptions), 0);
  EXPECT_EQ(requete(t, R"(SELECT AFLBUD_IDENT, COMPOSANT, PIECE, QTE, HT FROM "QUARVO"
                           WHERE COMPOSANT = 'GAPEBL')"),
            "0000000214|GAPEBL|BR26100001|2.0|360.00\n");
  // The company books goods received: the part not yet invoiced is realised, with a movement.
  EXPECT_EQ(requete(t, R"(SELECT VENG, VREA FROM "AFLBUD" WHERE IDENT = '0000000214')"),
            "0.00|360.00;360.00;360.00\n");
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "AFMOUV" WHERE COMPOSANT = 'GAPEBL')"), "1\n");

  // A quote request is settled on every run, also when it already exists.
  std::string demandes =
      test::enteteAutre() + ligne({"DF26100001", "07/09/2026", "LOCAPRO", "AFF003", "",
                                   "NACELLE-JOUR", "", "2", "180", "0", "20", "", "", "", "1"});
  EXPECT_EQ(importer(t, "DF", demandes), 0);
  t.sql(R"(UPDATE "GAPEDEV" SET "SOLDEE" = 0 WHERE "NUMERO_DOC" = 'DF26100001')");
  EXPECT_EQ(importer(t, "DF", demandes), 0);
  EXPECT_EQ(
      requete(t, R"(SELECT NUMERO_DOC, SOLDEE, VALIDEE FROM "GAPEDEV" WHERE IDENT > '0000001000')"),
      "DF26100001|1|1\n");
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "QUARVO" WHERE COMPOSANT = 'GAPEDEV')"), "0\n");
  EXPECT_EQ(t.ui().transcriptText().find("MESSAGE"), std::string::npos);
}

TEST(ImportGenererTest, APieceThePurchasingModuleRefusesIsNotWrittenAtAll) {
  test::TestSession t(true);
  // Nothing staged: no generation is opened, so none is closed and nothing is shown.
  EXPECT_EQ(lancer(t, "IMPORT_GENERER_BF"), 0);
  EXPECT_EQ(t.ui().transcriptText(), "");

  // Staged without control: the purchasing module refuses the unknown supplier. The piece is
  // not created and none of its lines is booked on the budget; the next piece is.
  std::string file = test::enteteAutre() +
                     ligne({"CF26300001", "05/12/2026", "INCONNU", "AFF001", "BU26-0001",
                            "CABLE-3G2.5", "", "1", "180", "0", "20", "", "", "", "0"}) +
                     ligne({"CF26300001", "05/12/2026", "INCONNU", "AFF001", "BU26-0001",
                            "CABLE-3G2.5", "", "2", "180", "0", "20", "", "", "", "0"}) +
                     ligne({"CF26300002", "05/12/2026", "ELECDIS", "AFF001", "BU26-0001",
                            "CABLE-3G2.5", "", "1", "180", "0", "20", "", "", "", "0"});
  auto path = test::ecrireFichier(t, "cf.txt", file);
  ASSERT_EQ(charger(t, "IMM_PIECE_CF", path.string()), 0);
  EXPECT_EQ(lancer(t, "IMPORT_GENERER_CF"), 1);
  EXPECT_NE(t.ui().transcriptText().find("MESSAGE Erreur | La pièce n'a pas de fournisseur connu : "
                                         "elle n'est pas créée. | [OK]"),
            std::string::npos)
      << t.ui().transcriptText();
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC FROM "GAPECOM" WHERE IDENT > '0000001000')"),
            "CF26300002\n");
  EXPECT_EQ(requete(t, R"(SELECT PIECE, HT FROM "QUARVO")"), "CF26300002|180.00\n");
  EXPECT_EQ(requete(t, R"(SELECT VENG FROM "AFLBUD" WHERE IDENT = '0000000211')"), "180.00\n");
}

// What a run leaves behind, without the times of day.
std::string etat(test::TestSession& t) {
  return requete(t,
                 R"(SELECT IDENT, NUMERO_DOC, SOLDEE, VALIDEE, BRUT, HT, TTC, QTNT, GAPAPPOR_IDENT
                         FROM "GAPECOM" ORDER BY IDENT)") +
         requete(t, R"(SELECT IDENT, NUMERO, GCPARTIC_CODE, QTE, QTE_SOLDEE, HT FROM "GAPLCOM"
                         ORDER BY IDENT)") +
         requete(t, R"(SELECT IDENT, AFLBUD_IDENT, COMPOSANT_IDENT, PIECE, QTE, HT, CLE_COMPO
                         FROM "QUARVO" ORDER BY IDENT)") +
         requete(t, R"(SELECT IDENT, NUMERO, VENG, VREA, VRAF FROM "AFLBUD" ORDER BY IDENT)") +
         requete(t, R"(SELECT * FROM "AFRESU" ORDER BY 1, 2, 3)") +
         requete(t, R"(SELECT * FROM "GAPARTFO" ORDER BY IDENT)") +
         requete(t, R"(SELECT * FROM "ZUMNDOC" ORDER BY 1, 2, 3)");
}

// Five orders of three lines; `pieces` keeps the first ones only.
std::string commandesEnSerie(int pieces = 5) {
  std::string file = test::enteteAutre();
  const char* articles[] = {"CABLE-3G2.5", "TABLEAU-ELEC", "CABLE-3G2.5"};
  for (int piece = 1; piece <= pieces; ++piece) {
    for (int l = 0; l < 3; ++l) {
      file += ligne({"CF2620000" + std::to_string(piece), "0" + std::to_string(piece) + "/12/2026",
                     "ELECDIS", "AFF001", piece == 4 ? "" : "BU26-0001", articles[l], "",
                     std::to_string(piece + l), "10,5", "0", "20", "", "", "",
                     piece % 2 == 0 ? "1" : "0"});
    }
  }
  return file;
}

// A run that stopped after its first pieces (a kill between two commits leaves exactly that; the
// kills themselves are in tests/scenario/crash_test.cpp): the whole file run again completes the
// job, and pieces, links, budget figures and counters are those of one run of the whole file.
TEST(ImportGenererTest, ARerunAfterARunThatStoppedPartWayCreatesNothingTwice) {
  std::string reference;
  {
    test::TestSession t(true);
    importer(t, "CF", commandesEnSerie());
    reference = etat(t);
    importer(t, "CF", commandesEnSerie());
    EXPECT_EQ(etat(t), reference) << "the same file imported twice";
  }
  for (int n : {1, 3}) {
    test::TestSession t(true);
    importer(t, "CF", commandesEnSerie(n));
    EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "GAPECOM" WHERE IDENT > '0000001000')"),
              std::to_string(n) + "\n");
    importer(t, "CF", commandesEnSerie());
    EXPECT_EQ(etat(t), reference) << "rerun after " << n << " pieces";
  }
}

}  // namespace
}  // namespace quarvo
