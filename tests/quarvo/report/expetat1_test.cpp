#include <gtest/gtest.h>

#include <sstream>
#include <vector>

#include "quarvo/report/ReportFixture.h"

namespace quarvo {
namespace {

using host::Automate;
using test::ReportFixture;

// The exported rows, cells split, without the header.
std::vector<std::vector<std::string>> cellules(const std::string& text) {
  std::vector<std::vector<std::string>> rows;
  std::istringstream in(text);
  std::string line;
  while (std::getline(in, line)) {
    if (!line.empty() && line.back() == '\r') line.pop_back();
    std::vector<std::string> cells;
    size_t start = 0;
    for (size_t tab; (tab = line.find('\t', start)) != std::string::npos; start = tab + 1) {
      cells.push_back(line.substr(start, tab - start));
    }
    cells.push_back(line.substr(start));
    rows.push_back(cells);
  }
  return rows;
}

// Columns 7 to 18 of the row whose piece (column 10) or type (column 9) is `which`, within
// the budget line `service`: service, label, type, piece, date, origin, amounts.
std::string ligne(const std::vector<std::vector<std::string>>& rows, const std::string& service,
                  const std::string& which) {
  for (const auto& r : rows) {
    if (r.size() == 18 && r[6] == service && (r[9] == which || r[8] == which)) {
      std::string out;
      for (size_t i = 6; i < 18; ++i) out += (i > 6 ? "|" : "") + r[i];
      return out;
    }
  }
  return "<none>";
}

TEST(Expetat1Test, WritesTheEighteenColumnsWithRunningAmountsPerBudgetLine) {
  ReportFixture f;
  auto file = f.t().dir() / "export" / "suivi.txt";
  Automate& w = f.preparer(file.string());
  ASSERT_EQ(f.lever(w, "VALID"), 0);
  auto rows = cellules(ReportFixture::lire(file));
  ASSERT_FALSE(rows.empty());
  EXPECT_EQ(rows[0], (std::vector<std::string>{
                         "CRITERE", "CRITERE_DESIG", "AFAFFA_CODE", "V_AFAFFA_DESIG", "V_BUDGET",
                         "V_BUDGET_DESIG", "V_PRESTATION", "V_PRESTATION_DESIG", "V_TYPE",
                         "V_PIECE", "V_DATE_PIECE", "ORIGINE", "BUDGETE", "ENGAGE", "V_DISPONIBLE",
                         "RECEPTIONNE", "FACTURE", "V_SOLDE"}));
  EXPECT_EQ(rows.size(), 27u);
  // Project, budget with its origin caption, line with its chapter.
  EXPECT_EQ(rows[1][2] + "|" + rows[1][3] + "|" + rows[1][4] + "|" + rows[1][5],
            "AFF001|Rénovation de l'école des Érables|Commande client n° BU26-0001|Budget des "
            "travaux de rénovation");
  // Within a line: its own row opens the running amounts with its budget; orders lower what is
  // available, orders less invoices make what is outstanding.
  EXPECT_EQ(ligne(rows, "SST-MACO", "0AFEBUD"),
            "SST-MACO|2) Sous-traitance maçonnerie|0AFEBUD||||9000.00|0.00|9000.00|0.00|0.00|0.00");
  EXPECT_EQ(ligne(rows, "SST-MACO", "BC CF26000003"),
            "SST-MACO|2) Sous-traitance maçonnerie|2GAPECOM|BC "
            "CF26000003|05/05/2026||0.00|3600.00|5400.00|0.00|0.00|3600.00");
  EXPECT_EQ(ligne(rows, "SST-MACO", "F FF26000002"),
            "SST-MACO|2) Sous-traitance maçonnerie|4GAPEFAC|F "
            "FF26000002|29/05/2026||0.00|0.00|5400.00|0.00|1764.00|1836.00");
  // Orders beyond the budget and invoices beyond the orders: never below 0. The chapter "2"
  // prints as "2) " like "2)".
  EXPECT_EQ(ligne(rows, "LOC-ENG", "BC CF26000002"),
            "LOC-ENG|2) Location de nacelle élévatrice|2GAPECOM|BC "
            "CF26000002|10/04/2026||0.00|2500.00|0.00|0.00|0.00|2500.00");
  EXPECT_EQ(ligne(rows, "LOC-ENG", "F FF26000003"),
            "LOC-ENG|2) Location de nacelle élévatrice|4GAPEFAC|F "
            "FF26000003|30/04/2026|BR26000002|0.00|0.00|0.00|0.00|3000.00|0.00");
  // Other linked documents, the gathered earlier pieces, a credit note.
  EXPECT_EQ(ligne(rows, "MO-TECH", "F TE26000001"),
            "MO-TECH|3) Main-d'œuvre technicien|5AFEFFO|F "
            "TE26000001|15/06/2026||0.00|0.00|4200.00|0.00|280.00|0.00");
  EXPECT_EQ(ligne(rows, "MAT-ELEC", "1"),
            "MAT-ELEC|1) Matériel électrique|1||||0.00|1350.00|4650.00|1350.00|1350.00|0.00");
  EXPECT_EQ(ligne(rows, "MAT-ELEC", "A AV26000001"),
            "MAT-ELEC|1) Matériel électrique|4GAPEFAC|A "
            "AV26000001|15/04/2026|FF26000001|0.00|0.00|4650.00|0.00|-315.00|315.00");
  // A budget entered by hand has no origin caption; a budget from a customer quote has one.
  bool manuel = false;
  bool devis = false;
  for (const auto& r : rows) {
    if (r.size() == 18 && r[2] == "AFF002") manuel = r[4] == "MANUEL";
    if (r.size() == 18 && r[2] == "AFF003") devis = r[4] == "Devis client n° BU26-0003";
  }
  EXPECT_TRUE(manuel);
  EXPECT_TRUE(devis);
  // Order: projects, then budgets, then lines in their number order, line row first.
  EXPECT_EQ(rows[1][6] + " " + rows[2][6] + " " + rows[4][6], "MAT-ELEC MAT-ELEC MAT-PLOM");
}

TEST(Expetat1Test, AWorkbookKeepsNumbersAsNumbersAndDatesAsDates) {
  ReportFixture f;
  auto file = f.t().dir() / "suivi.xlsx";
  Automate& w = f.preparer(file.string());
  ASSERT_EQ(f.lever(w, "VALID"), 0);
  ASSERT_TRUE(std::filesystem::exists(file));
  std::string quoted = "'" + file.string() + "'";
  std::string sheet = ReportFixture::commande("unzip -p " + quoted + " xl/worksheets/sheet1.xml");
  std::string styles = ReportFixture::commande("unzip -p " + quoted + " xl/styles.xml");
  // 27 rows: the header and the 26 report rows.
  EXPECT_NE(sheet.find("<row r=\"27\""), std::string::npos);
  EXPECT_EQ(sheet.find("<row r=\"28\""), std::string::npos);
  // Amounts are numbers (no "t=" string type), dates are day numbers with a date format; texts
  // are written in the rows themselves.
  EXPECT_NE(sheet.find("<v>5400</v>"), std::string::npos);
  EXPECT_NE(sheet.find("<v>1836</v>"), std::string::npos);
  EXPECT_NE(sheet.find("<v>-315</v>"), std::string::npos);
  EXPECT_NE(sheet.find("<v>46147</v>"), std::string::npos);  // 05/05/2026
  EXPECT_NE(styles.find("dd/mm/yyyy"), std::string::npos);
  EXPECT_NE(styles.find("#,##0.00"), std::string::npos);
  for (const char* text :
       {"V_DISPONIBLE", "5AFEFFO", "BC CF26000003", "2) Location de nacelle élévatrice",
        "Réseau d'eau potable — hameau de Sainte-Hélène"}) {
    EXPECT_NE(sheet.find(text), std::string::npos) << text;
  }
  // Nothing but the workbook is left beside it.
  size_t files = 0;
  for (const auto& e : std::filesystem::directory_iterator(f.t().dir()))
    files += e.path().extension() == ".xlsx" || e.path().extension() == ".part";
  EXPECT_EQ(files, 1u);
}

}  // namespace
}  // namespace quarvo
