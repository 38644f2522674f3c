#include "host/automate/Export.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <sstream>

#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

std::string lire(const std::filesystem::path& p) {
  std::ifstream in(p, std::ios::binary);
  std::ostringstream s;
  s << in.rdbuf();
  return s.str();
}

void remplir(test::TestSession&) {
  Table m(nullptr, "VOVOVA", "M_EXPORT", "TEST");
  struct R {
    const char* ident;
    const char* numero;
    const char* budget;
    const char* texte;
    int64_t cents;
  };
  const R rows[] = {{"c", "0000000201|10", "B2", "dix\tavec tabulation", 1050},
                    {"a", "0000000201|2", "B2", "deux", -250},
                    {"b", "0000000201|2", "B1", "deux bis", 0},
                    {"d", "0000000200|9", "B9", "Été", 123456789}};
  for (const auto& r : rows) {
    m.preparer();
    m.ecrire("IDENT", Valeur::chaine(r.ident));
    m.ecrire("NUMERO", Valeur::chaine(r.numero));
    m.ecrire("BUD_IDENT", Valeur::chaine(r.budget));
    m.ecrire("TEXTE", Valeur::chaine(r.texte));
    m.ecrire("MONTANT", Valeur::monnaie(Monnaie::fromMicros(r.cents * 10000)));
    m.ecrire("JOUR", Valeur::date(Date::of(2026, 5, 5)));
    m.inserer();
  }
}

int exporter(const std::string& file, const std::string& mode) {
  Export e(nullptr);
  Field& calc = e.chaine("V_CALC", "", "calculé");
  (void)calc;
  e.fichier(file);
  e.format("EXCEL1");
  e.mode(mode);
  e.nomTable("M_EXPORT");
  e.planTri("($TRI$", {"M_EXPORT.IDENT", "M_EXPORT.NUMERO", "M_EXPORT.BUD_UNIQ"});
  e.zones({"NUMERO", "TEXTE", "MONTANT", "JOUR", "V_CALC"});
  e.executer(nullptr);
  EXPECT_TRUE(e.termine());
  return e.outcome();
}

TEST(ExportTest, WritesZonesInSortPlanOrderAsExchangeText) {
  test::TestSession t;
  remplir(t);
  auto file = t.dir() / "a" / "export.txt";
  ASSERT_EQ(exporter(file.string(), "SI"), 0);
  // Digit runs sort as numbers ("|2" before "|10"); "BUD_UNIQ" stands for "BUD_IDENT"; the key
  // only breaks ties. A text holding a tab is quoted, as the loader and spreadsheets read it.
  EXPECT_EQ(lire(file),
            "NUMERO\tTEXTE\tMONTANT\tJOUR\tV_CALC\r\n"
            "0000000200|9\tÉté\t1234567.89\t05/05/2026\tcalculé\r\n"
            "0000000201|2\tdeux bis\t0.00\t05/05/2026\tcalculé\r\n"
            "0000000201|2\tdeux\t-2.50\t05/05/2026\tcalculé\r\n"
            "0000000201|10\t\"dix\tavec tabulation\"\t10.50\t05/05/2026\tcalculé\r\n");
  // Without "S" the rows are added to the existing file, without a second header.
  ASSERT_EQ(exporter(file.string(), "I"), 0);
  std::string twice = lire(file);
  EXPECT_EQ(twice.find("NUMERO", 1), std::string::npos);
  EXPECT_EQ(std::count(twice.begin(), twice.end(), '\n'), 9);
  EXPECT_FALSE(std::filesystem::exists(file.string() + ".part"));
  EXPECT_EQ(t.ui().transcriptText(), "");
}

TEST(ExportTest, AFileThatCannotBeWrittenFailsAndLeavesNothing) {
  test::TestSession t;
  remplir(t);
  std::ofstream(t.dir() / "plain").put('x');
  auto file = t.dir() / "plain" / "export.txt";  // its folder is a file
  EXPECT_EQ(exporter(file.string(), "SI"), 1);
  EXPECT_NE(t.ui().transcriptText().find("Export impossible"), std::string::npos);
  auto xlsx = t.dir() / "plain" / "export.xlsx";
  t.ui().clear();
  EXPECT_EQ(exporter(xlsx.string(), "SI"), 1);
  EXPECT_NE(t.ui().transcriptText().find("Export impossible"), std::string::npos);
  for (const auto& entry : std::filesystem::recursive_directory_iterator(t.dir())) {
    EXPECT_EQ(entry.path().filename().string().find("export"), std::string::npos) << entry.path();
  }
}

TEST(ExportTest, SortPlanComparesDigitRunsAsNumbers) {
  auto c = [](const char* a, const char* b) {
    return comparerTri(Valeur::chaine(a), Valeur::chaine(b));
  };
  EXPECT_LT(c("L|2", "L|10"), 0);
  EXPECT_LT(c("L|02", "L|10"), 0);
  EXPECT_GT(c("L|10", "L|9"), 0);
  EXPECT_LT(c("AFF", "AFF001"), 0);
  EXPECT_EQ(c("X7", "X7"), 0);
  EXPECT_NE(c("X07", "X7"), 0);  // equal numbers, different texts: still a total order
  EXPECT_EQ(c("X07", "X7"), -c("X7", "X07"));
  EXPECT_LT(comparerTri(Valeur::entier(2), Valeur::entier(10)), 0);
}

}  // namespace
}  // namespace quarvo::host
