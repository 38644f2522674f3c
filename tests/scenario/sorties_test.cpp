// What the report and the imputation give, kept from a version known to be right: the demo's
// follow-up report (the text export, the workbook's sheet and styles, the PDF's text) and every
// table an imputation writes on a generated company. A change made for speed must leave them
// byte for byte as they are; one that means to change them replaces the kept files knowingly
// (a failing comparison leaves the new output beside the test's folder and names it).
#include <gtest/gtest.h>

#include <algorithm>
#include <regex>

#include "quarvo/report/ReportFixture.h"
#include "support/Programme.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

namespace fs = std::filesystem;

fs::path attendus() {
  return fs::path(QUARVO_SOURCE_DIR) / "tests" / "data" / "sorties";
}

// Where a differing output is left (the test's own folder is removed when it ends).
fs::path nouveaux() {
  return fs::temp_directory_path() / "quarvo-sorties-nouvelles";
}

// Compares `actuel` with the kept file `nom`; on a difference, writes it to `nouveaux()/nom`.
void comparer(const std::string& nom, const std::string& actuel) {
  fs::path ecrit = nouveaux();
  fs::path garde = attendus() / nom;
  std::string attendu = fs::exists(garde) ? test::lire(garde) : std::string();
  if (attendu == actuel) return;
  fs::create_directories(ecrit);
  std::ofstream(ecrit / nom, std::ios::binary) << actuel;
  ADD_FAILURE() << nom << " differs from the kept output; the new one is " << (ecrit / nom);
}

std::string commande(const std::string& c) {
  return test::ReportFixture::commande(c);
}

TEST(SortiesTest, TheDemoReportIsUnchanged) {
  test::TestSession t(false);
  fs::path dir = t.dir() / "demo";
  fs::path db = dir / "quarvo.db";
  ASSERT_EQ(test::executer(db, {"demo", "--dir", dir.string()}, t.dir() / "demo.log"), 0)
      << test::lire(t.dir() / "demo.log");
  fs::path out = t.dir() / "out";
  fs::create_directories(out);
  ASSERT_EQ(test::executer(
                db,
                {"report", "--from", "01/01/2026", "--to", "31/12/2026", "--criterion", "AFCLIE",
                 "--options", "11111", "--print", (out / "suivi.pdf").string(), "--export",
                 (out / "suivi.txt").string(), "--export", (out / "suivi.xlsx").string()},
                t.dir() / "report.log"),
            0)
      << test::lire(t.dir() / "report.log");

  comparer("suivi.txt", test::lire(out / "suivi.txt"));
  std::string xlsx = "'" + (out / "suivi.xlsx").string() + "'";
  comparer("sheet1.xml", commande("unzip -p " + xlsx + " xl/worksheets/sheet1.xml"));
  comparer("styles.xml", commande("unzip -p " + xlsx + " xl/styles.xml"));
  // The pages carry the day they were printed.
  std::string pdf = commande("pdftotext -layout '" + (out / "suivi.pdf").string() + "' -");
  pdf = std::regex_replace(pdf, std::regex("édité le [0-9]{2}/[0-9]{2}/[0-9]{4}"),
                           "édité le JJ/MM/AAAA");
  comparer("suivi.pdf.txt", pdf);
}

TEST(SortiesTest, TheTablesAnImputationWritesAreUnchanged) {
  test::TestSession t(false);
  fs::path db = t.dir() / "gen.db";
  fs::path log = t.dir() / "run.log";
  ASSERT_EQ(test::executer(db, {"init", "--demo"}, log), 0) << test::lire(log);
  ASSERT_EQ(test::executer(db, {"gen", "--projects", "10", "--pieces", "100", "--lines", "5"}, log),
            0)
      << test::lire(log);
  ASSERT_EQ(test::executer(db, {"impute"}, log), 0) << test::lire(log);

  test::Lecture l(db);
  for (const char* table : {"QUARVO", "AFLBUD", "AFRESU", "AFMOUV", "ZUMNDOC"}) {
    std::vector<std::string> lignes =
        l.lignes(std::string("SELECT ") + l.colonnes(table) + " FROM \"" + table + "\"");
    std::sort(lignes.begin(), lignes.end());
    std::string texte;
    for (const auto& ligne : lignes) texte += ligne + '\n';
    comparer(std::string("imputation.") + table + ".tsv", texte);
  }
  ASSERT_TRUE(l.erreur().empty()) << l.erreur();
}

}  // namespace
}  // namespace quarvo
