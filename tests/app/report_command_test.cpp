#include <gtest/gtest.h>

#include <sstream>

#include "app/ReportCommand.h"
#include "app/Workspace.h"
#include "quarvo/report/ReportFixture.h"

namespace quarvo {
namespace {

using app::ReportOptions;
using app::ReportPaths;
using test::ReportFixture;

TEST(ReportCommandTest, PrintsAndExportsTheSelectionGivenOnTheCommandLine) {
  ReportFixture f;
  ReportOptions o;
  o.from = "2026-04-01";
  o.to = "31/12/2026";
  o.budget = "0000000202";
  o.options = "11100";
  o.print = (f.t().dir() / "out" / "suivi.pdf").string();
  o.exports = {(f.t().dir() / "out" / "suivi.txt").string(),
               (f.t().dir() / "out" / "suivi.xlsx").string()};
  std::ostringstream out;
  ReportPaths paths;
  ASSERT_EQ(app::runReport(f.t().session(), o, out, &paths), 0);
  EXPECT_EQ(out.str(), "report exported to " + o.exports[0] + "\nreport exported to " +
                           o.exports[1] + "\nreport printed to " + *o.print + "\n");
  EXPECT_TRUE(std::filesystem::exists(o.exports[1]));  // one command, each output
  EXPECT_EQ(paths.pdf, *o.print);
  std::string exported = ReportFixture::lire(o.exports[0]);
  EXPECT_NE(exported.find("AFF002\tRéseau d'eau potable — hameau de Sainte-Hélène\tMANUEL"),
            std::string::npos);
  EXPECT_EQ(exported.find("AFF001"), std::string::npos);  // only the chosen budget
  std::string pdf = ReportFixture::commande("pdftotext '" + *o.print + "' -");
  EXPECT_NE(pdf.find("Budget MANUEL"), std::string::npos);
  EXPECT_EQ(pdf.find("Budget BU26-0001"), std::string::npos);
  EXPECT_EQ(f.t().session().fenetresOuvertes(), 0u);  // the screen is closed afterwards
}

TEST(ReportCommandTest, BadOptionsAndRefusals) {
  ReportFixture f;
  std::ostringstream out;
  ReportOptions bad;
  bad.options = "1110";
  EXPECT_THROW(app::runReport(f.t().session(), bad, out), app::UsageError);
  bad.options.clear();
  bad.criterion = "AFXYZ";
  EXPECT_THROW(app::runReport(f.t().session(), bad, out), app::UsageError);
  bad.criterion.clear();
  bad.from = "32/01/2026";
  EXPECT_THROW(app::runReport(f.t().session(), bad, out), app::UsageError);
  bad.from.clear();
  bad.budget = "0000009999";
  EXPECT_THROW(app::runReport(f.t().session(), bad, out), app::UsageError);

  // The screen refuses a period past the fiscal year: nothing written, a failed run.
  ReportOptions late;
  late.to = "15/01/2027";
  late.exports = {(f.t().dir() / "late.txt").string()};
  EXPECT_EQ(app::runReport(f.t().session(), late, out), 1);
  EXPECT_FALSE(std::filesystem::exists(late.exports[0]));
  EXPECT_NE(f.t().ui().transcriptText().find("[100]"), std::string::npos);
}

TEST(ReportCommandTest, TheDemoFollowUpIsPrintedAndExported) {
  ReportFixture f;
  ReportPaths paths = app::reportDemo(f.t().session(), f.t().dir() / "demo");
  EXPECT_EQ(paths.pdf, f.t().dir() / "demo" / "suivi_achats.pdf");
  EXPECT_EQ(paths.exported, f.t().dir() / "demo" / "suivi_achats.xlsx");
  std::string pdf = ReportFixture::commande("pdftotext '" + paths.pdf.string() + "' -");
  EXPECT_NE(pdf.find("Récapitulatif par Client"), std::string::npos);
  EXPECT_NE(pdf.find("Commune de Belleville-sur-Orne"), std::string::npos);
}

}  // namespace
}  // namespace quarvo
