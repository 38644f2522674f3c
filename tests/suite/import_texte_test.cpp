#include <gtest/gtest.h>

#include <fstream>
#include <sstream>

#include "quarvo/import/ImportSupport.h"
#include "suite/ImportTexte.h"

namespace quarvo {
namespace {

using test::charger;
using test::ecrireFichier;
using test::requete;

std::string erreurs(test::TestSession& t) {
  return requete(t,
                 R"(SELECT IDENT, COMPOSANT, CODE, DESIG, CMT FROM "IMM_ERREUR" ORDER BY IDENT)");
}

TEST(ImportTexteTest, LoadsCrlfWindows1252AnyColumnOrderAndReplacesTheStagedFile) {
  test::TestSession t;
  t.sql(R"(INSERT INTO "IMM_PIECE_CF" ("NUMERO_DOC") VALUES ('ANCIEN'))");
  // Windows-1252 "é" is 0xE9; a byte-order mark on an otherwise UTF-8 line is dropped.
  std::string file =
      "\xEF\xBB\xBF"
      "DESIG\tnumero_doc\tQTE\tPUHT\tDATE_CREATION\tSOLDE\tFOURNISSEUR\tARTICLE\r\n"
      "Tube \"PER\"\tC1\t2,5\t1 0\t01/12/2026\t1\tS\tA\r\n";
  auto bad = ecrireFichier(t, "cf.txt", file);
  EXPECT_EQ(charger(t, "IMM_PIECE_CF", bad.string()), 1);  // "1 0" is no number
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC FROM "IMM_PIECE_CF")"), "ANCIEN\n");
  EXPECT_EQ(erreurs(t),
            "0000000001|IMM_PIECE_CF|C1|Fichier cf.txt, ligne 2|colonne PUHT, valeur \"1 0\" : "
            "nombre attendu (virgule ou point décimal)\n");

  file =
      "DESIG\tnumero_doc\tQTE\tPUHT\tDATE_CREATION\tSOLDE\tFOURNISSEUR\tARTICLE\r\n"
      "Coude \xE9quip\xE9\tC1\t2,5\t180.50\t01/12/2026\t1\tS\tA\r\n"
      "\r\n"
      "\"Tube \"\"PER\"\"\"\tC2\t3\t 12,125 \t2026-11-30\t0\tS\tA\n"
      // A quoted designation may hold a tab and a line break; rows keep the line they start on.
      "\"Coude\tdouble\r\nsur deux lignes\"\tC3\t1\t1\t01/12/2026\t0\tS\tA\r\n"
      "Manchon\tC4\t1\t2\t01/12/2026\t0\tS\tA\n";
  auto good = ecrireFichier(t, "cf2.TXT", file);
  EXPECT_EQ(charger(t, "IMM_PIECE_CF", good.string()), 0);
  EXPECT_EQ(requete(t, R"(SELECT IDENT, NUMERO_DOC, DESIG, QTE, PUHT, DATE_CREATION, SOLDE,
                              LIGNE_FICHIER FROM "IMM_PIECE_CF" ORDER BY IDENT)"),
            "0000000001|C1|Coude équipé|2.5|180.50|2026-12-01|1|2\n"
            "0000000002|C2|Tube \"PER\"|3.0|12.125|2026-11-30|0|4\n"
            "0000000003|C3|Coude\tdouble\nsur deux lignes|1.0|1.00|2026-12-01|0|5\n"
            "0000000004|C4|Manchon|1.0|2.00|2026-12-01|0|7\n");
}

TEST(ImportTexteTest, EveryFaultNamesFileLineColumnAndValueAndStagesNothing) {
  test::TestSession t;
  t.sql(R"(INSERT INTO "IMM_PIECE_FF" ("NUMERO_DOC") VALUES ('GARDE');
           INSERT INTO "IMM_ERREUR" ("IDENT") VALUES ('0000000041'))");
  std::string file =
      "NUMERO_DOC\tDATE_CREATION\tQTE\tVALIDE\tFOURNISSEUR\tARTICLE\tPUHT\n"
      "F1\t31/02/2026\t1\t1\tS\tA\t1\n"     // impossible date
      "F2\t01/12/2026\tdeux\t1\tS\tA\t1\n"  // number with letters
      "F3\t01/12/2026\t1\tS\tA\t1\n"        // a value missing
      "F4\t01/12/26\t1\t1,5\tS\tA\t1\n";    // two-digit year, decimal integer
  auto path = ecrireFichier(t, "ff.txt", file);
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", path.string()), 1);
  EXPECT_EQ(requete(t, R"(SELECT CODE, DESIG, CMT FROM "IMM_ERREUR" WHERE IDENT > '0000000041')"),
            "F1|Fichier ff.txt, ligne 2|colonne DATE_CREATION, valeur \"31/02/2026\" : date "
            "jj/mm/aaaa attendue\n"
            "F2|Fichier ff.txt, ligne 3|colonne QTE, valeur \"deux\" : nombre attendu (virgule ou "
            "point décimal)\n"
            "F3|Fichier ff.txt, ligne 4|6 valeurs pour 7 colonnes\n"
            "F4|Fichier ff.txt, ligne 5|colonne DATE_CREATION, valeur \"01/12/26\" : date "
            "jj/mm/aaaa attendue\n"
            "F4|Fichier ff.txt, ligne 5|colonne VALIDE, valeur \"1,5\" : nombre entier attendu\n");
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC FROM "IMM_PIECE_FF")"), "GARDE\n");

  t.sql(R"(DELETE FROM "IMM_ERREUR")");
  auto header = ecrireFichier(t, "entete.txt", "F1\t01/12/2026\nF2\t02/12/2026\n");
  auto unknown = ecrireFichier(t, "inconnu.txt", "NUMERO_DOC\tPRIX\tNUMERO_DOC\n");
  auto empty = ecrireFichier(t, "vide.txt", "");
  auto binary = ecrireFichier(t, "image.txt",
                              "NUMERO_DOC\tDATE_CREATION\tFOURNISSEUR\tARTICLE\tQTE\tPUHT\nGIF89a" +
                                  std::string("\0\x01\x02", 3));
  // Without a column a piece cannot be generated without, the file is refused, naming it.
  auto sansQte = ecrireFichier(t, "sansqte.txt",
                               "NUMERO_DOC\tDATE_CREATION\tFOURNISSEUR\tARTICLE\tPUHT\n"
                               "F1\t01/12/2026\tS\tA\t1\n");
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", header.string()), 1);
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", unknown.string()), 1);
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", empty.string()), 1);
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", binary.string()), 1);
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", sansQte.string()), 1);
  EXPECT_EQ(charger(t, "IMM_PIECE_FF", (t.dir() / "absent.txt").string()), 1);
  EXPECT_EQ(charger(t, "QUARVO", header.string()), 1);  // only import tables are loaded
  std::string all = requete(t, R"(SELECT DESIG, CMT FROM "IMM_ERREUR" ORDER BY IDENT)");
  EXPECT_EQ(all,
            "Fichier entete.txt, ligne 1|colonne F1, valeur \"\" : colonne inconnue de la table "
            "IMM_PIECE_FF\n"
            "Fichier entete.txt, ligne 1|colonne 01/12/2026, valeur \"\" : colonne inconnue de la "
            "table IMM_PIECE_FF\n"
            "Fichier inconnu.txt, ligne 1|colonne PRIX, valeur \"\" : colonne inconnue de la "
            "table IMM_PIECE_FF\n"
            "Fichier inconnu.txt, ligne 1|colonne NUMERO_DOC, valeur \"\" : colonne nommée deux "
            "fois\n"
            "Fichier vide.txt|fichier vide : la première ligne doit nommer les colonnes\n"
            "Fichier image.txt, ligne 2|contenu binaire (caractère de contrôle 0) : ce n'est pas "
            "un fichier texte\n"
            "Fichier sansqte.txt, ligne 1|colonne QTE, valeur \"\" : colonne absente : la première "
            "ligne doit la nommer\n"
            "Fichier absent.txt|valeur \"" +
                (t.dir() / "absent.txt").string() +
                "\" : fichier introuvable\n"
                "Fichier entete.txt|valeur \"QUARVO\" : table d'import inconnue\n");
  EXPECT_EQ(requete(t, R"(SELECT NUMERO_DOC FROM "IMM_PIECE_FF")"), "GARDE\n");
}

TEST(ImportTexteTest, LongLinesAreRefusedAndBigFilesStream) {
  test::TestSession t;
  const std::string colonnes = "\tDATE_CREATION\tFOURNISSEUR\tARTICLE\tPUHT\n";
  const std::string valeurs = "\t01/12/2026\tS\tA\t1\n";
  std::string file = "NUMERO_DOC\tDESIG\tQTE" + colonnes + "F1\t" + std::string(70 * 1024, 'x') +
                     "\t1" + valeurs + "F2\tok\t1" + valeurs;
  auto path = ecrireFichier(t, "long.txt", file);
  EXPECT_EQ(charger(t, "IMM_PIECE_DF", path.string()), 1);
  EXPECT_EQ(requete(t, R"(SELECT CMT FROM "IMM_ERREUR")"), "ligne de plus de 65536 caractères\n");

  std::ostringstream big;
  big << "NUMERO_DOC\tQTE" << colonnes;
  for (int i = 0; i < 20000; ++i) big << "D" << i / 3 << "\t" << i << ",5" << valeurs;
  auto bigPath = ecrireFichier(t, "gros.txt", big.str());
  EXPECT_EQ(charger(t, "IMM_PIECE_DF", bigPath.string()), 0);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*), SUM(QTE) FROM "IMM_PIECE_DF")"), "20000|200000000.0\n");

  // A file full of faults stops after a bounded number of them.
  std::ostringstream faulty;
  faulty << "NUMERO_DOC\tQTE" << colonnes;
  for (int i = 0; i < 5000; ++i) faulty << "D\tx" << valeurs;
  auto faultyPath = ecrireFichier(t, "faux.txt", faulty.str());
  t.sql(R"(DELETE FROM "IMM_ERREUR")");
  EXPECT_EQ(charger(t, "IMM_PIECE_DF", faultyPath.string()), 1);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_ERREUR")"), "100\n");
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_PIECE_DF")"), "20000\n");

  // So does a header of 65,000 empty names: 100 faults, the last with the count of the others,
  // not 65,000 rows.
  auto wide = ecrireFichier(t, "large.txt", "NUMERO_DOC" + std::string(65000, '\t') + "\n");
  t.sql(R"(DELETE FROM "IMM_ERREUR")");
  EXPECT_EQ(charger(t, "IMM_PIECE_DF", wide.string()), 1);
  EXPECT_EQ(requete(t, R"(SELECT COUNT(*) FROM "IMM_ERREUR")"), "100\n");
}

TEST(ImportTexteTest, ErrorListIsShownAndSavedOrAppended) {
  test::TestSession t;
  host::EvtParamVal show{host::val(""), host::val("ach")};
  t.session().appelerProcedure("COMMUN", "IMPORT_CONSULTER_ERREURS", &show);
  t.sql(
      R"(INSERT INTO "IMM_ERREUR" VALUES ('0000000001', 'IMM_PIECE_FF', 'F1', 'Facture fournisseur no F1',
             'Code fournisseur <X> inexistant'),
             ('0000000002', 'IMM_PIECE_FF', 'F22', 'Fichier ff.txt, ligne 3',
              'colonne DESIG, valeur "a	b" : refusée'))");
  t.session().appelerProcedure("COMMUN", "IMPORT_CONSULTER_ERREURS", &show);
  // One aligned table under its heading.
  EXPECT_EQ(t.ui().transcriptText(),
            "MESSAGE Liste des erreurs d'import | Aucune erreur. | [OK]\n"
            "MESSAGE Liste des erreurs d'import | "
            "IDENT       COMPOSANT     CODE  DESIG                      CMT\n"
            "0000000001  IMM_PIECE_FF  F1    Facture fournisseur no F1  Code fournisseur <X> "
            "inexistant\n"
            "0000000002  IMM_PIECE_FF  F22   Fichier ff.txt, ligne 3    colonne DESIG, valeur "
            "\"a\tb\" : refusée | [OK]\n");

  auto report = t.dir() / "rapports" / "erreurs.txt";
  host::EvtParamVal save{host::val(report.string()), host::val("O")};
  EXPECT_EQ(t.session().appelerProcedure("COMMUN", "IMPORT_SAUVER_ERREURS", &save), 0);
  EXPECT_EQ(t.session().appelerProcedure("COMMUN", "IMPORT_SAUVER_ERREURS", &save), 0);
  std::ifstream in(report);
  std::stringstream text;
  text << in.rdbuf();
  // Written by the exchange format's rule: the value holding a tab is quoted, not altered.
  std::string lines =
      "0000000001\tIMM_PIECE_FF\tF1\tFacture fournisseur no F1\tCode fournisseur <X> "
      "inexistant\n"
      "0000000002\tIMM_PIECE_FF\tF22\tFichier ff.txt, ligne 3\t\"colonne DESIG, valeur "
      "\"\"a\tb\"\" : refusée\"\n";
  EXPECT_EQ(text.str(), "IDENT\tCOMPOSANT\tCODE\tDESIG\tCMT\n" + lines + lines);

  host::EvtParamVal unwritable{host::val((t.dir() / "rapports").string()), host::val("")};
  EXPECT_EQ(t.session().appelerProcedure("COMMUN", "IMPORT_SAUVER_ERREURS", &unwritable), 1);
}

TEST(ImportTexteTest, DecodingKeepsUtf8AndMapsWindows1252) {
  EXPECT_TRUE(suite::valideUtf8("Câble ≥ 3"));
  EXPECT_FALSE(suite::valideUtf8("\xC0\x80"));      // overlong
  EXPECT_FALSE(suite::valideUtf8("\xED\xA0\x80"));  // surrogate
  EXPECT_FALSE(suite::valideUtf8("\xE9t\xE9"));
  EXPECT_EQ(suite::depuisWindows1252("\x80 \x9C\xE9\x81"), "€ œé\xEF\xBF\xBD");
}

}  // namespace
}  // namespace quarvo
