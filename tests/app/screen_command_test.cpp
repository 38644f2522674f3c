// "quarvo screen": a script of actions played on a screen, the state printed after each.
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <sstream>

#include "app/ReportCommand.h"
#include "app/ScreenCommand.h"
#include "app/Workspace.h"
#include "host/automate/Edition_etat.h"
#include "quarvo/report/ReportFixture.h"
#include "support/TestSession.h"

namespace quarvo {
namespace {

using app::ScreenOptions;
using test::ReportFixture;

struct Sortie {
  int code;
  std::string out;
  std::string err;
};

Sortie ecran(ReportFixture& f, const std::string& name, const std::string& script,
             bool json = false) {
  ScreenOptions o;
  o.name = name;
  o.script = "-";
  o.json = json;
  std::istringstream in(script);
  std::ostringstream out;
  std::ostringstream err;
  int code = app::runScreen(f.t().session(), o, in, false, out, err);
  return {code, out.str(), err.str()};
}

TEST(ScreenCommandTest, AScriptPrintsTheSameReportAsTheReportCommand) {
  ReportFixture f;
  Sortie s = ecran(f, "QUARVO-SELETAT1",
                   "# the year, by customer, with both recapitulations\n"
                   "set VDATEMIN 01/01/2026\n"
                   "set VCLASSEMENT AFCLIE\n"
                   "\n"
                   "set VRECAP1 1\n"
                   "set VRECAP2 1\n"
                   "press VALID\n");
  ASSERT_EQ(s.code, 0) << s.out << s.err;
  // The state after opening and after each action, each action named before it.
  EXPECT_EQ(s.out.rfind("window SELETAT1 \"Suivi des achats par affaire\"\n", 0), 0u);
  EXPECT_NE(s.out.find("> set VCLASSEMENT AFCLIE\nwindow SELETAT1"), std::string::npos);
  EXPECT_NE(s.out.find("  VCLASSEMENT_LIB (Libellé du classement) = Client\n"), std::string::npos);
  auto printed = host::Edition_etat::destination(f.t().session(), "IMPETAT1");
  std::string viaEcran = ReportFixture::commande("pdftotext -layout '" + printed.string() + "' -");

  app::ReportOptions o;
  o.from = "01/01/2026";
  o.criterion = "AFCLIE";
  o.options = "11111";
  o.print = (f.t().dir() / "suivi.pdf").string();
  std::ostringstream out;
  ASSERT_EQ(app::runReport(f.t().session(), o, out), 0);
  std::string viaCommande = ReportFixture::commande("pdftotext -layout '" + *o.print + "' -");
  EXPECT_NE(viaEcran.find("Récapitulatif par Client"), std::string::npos);
  EXPECT_EQ(viaEcran, viaCommande);
}

TEST(ScreenCommandTest, ARefusedActionEndsTheScriptAndBadScriptsPlayNothing) {
  ReportFixture f;
  Sortie s = ecran(f, "QUARVO-SELETAT1",
                   "set VDATEMAX 32/13/2026\n"
                   "set VDATEMIN 01/01/2026\n");
  EXPECT_EQ(s.code, 1);
  EXPECT_NE(s.out.find("refused on VDATEMAX: VDATEMAX : « 32/13/2026 » n'est pas une date"),
            std::string::npos);
  EXPECT_EQ(s.out.find("> set VDATEMIN"), std::string::npos);  // not played
  EXPECT_EQ(s.err, "line 1: refused: VDATEMAX : « 32/13/2026 » n'est pas une date (jj/mm/aaaa).\n");

  try {
    ecran(f, "QUARVO-SELETAT1", "set VDATEMIN 01/01/2026\npush VALID\n");
    ADD_FAILURE() << "a script line that is not an action is a usage error";
  } catch (const app::UsageError& e) {
    EXPECT_EQ(std::string(e.what()),
              "the standard input line 2: 'push' is not an action (set, cell, select, tab, press, "
              "new, delete, answer, close)");
  }
  EXPECT_THROW(ecran(f, "QUARVO-NOTHING", ""), app::UsageError);
  EXPECT_THROW(ecran(f, "QUARVO-IMPUTER_AUTO", ""), app::UsageError);  // not a screen
  EXPECT_THROW(ecran(f, "QUARVO-SELETAT1", "select LST 0\n"), app::UsageError);
}

TEST(ScreenCommandTest, JsonIsOneObjectPerState) {
  ReportFixture f;
  Sortie s = ecran(f, "QUARVO-IMPORTER", "set V_MODE 0\npress V_FICHIER_DF_CHOISIR\n", true);
  ASSERT_EQ(s.code, 0) << s.err;
  std::istringstream lines(s.out);
  std::vector<nlohmann::json> states;
  for (std::string line; std::getline(lines, line);) states.push_back(nlohmann::json::parse(line));
  ASSERT_EQ(states.size(), 3u);
  EXPECT_EQ(states[1]["windows"][0]["fields"]["V_MODE"]["value"], "0");
  EXPECT_EQ(states[2]["dialog"]["kind"], "file");
  EXPECT_EQ(states[2]["dialog"]["title"], "Sélection d'un fichier");
}

TEST(LinkCommandTest, ALinkScriptOnTheDemoAndItsUsageErrors) {
  test::TestSession t(true);
  ScreenOptions o;
  o.script = "-";
  std::istringstream in("new LST\ncell LST 1 LST_C1 CF26000003\npress B_VALID_DOC\nclose\n");
  std::ostringstream out;
  std::ostringstream err;
  ASSERT_EQ(app::runLink(t.session(), "0000000213", "VMCA", o, in, false, out, err), 0)
      << out.str() << err.str();
  EXPECT_NE(out.str().find("> close\nno window open\n"), std::string::npos) << out.str();
  EXPECT_EQ(t.value("AFLBUD", "VENG", "IDENT", "0000000213"), "3600.00");
  std::istringstream rien("");
  EXPECT_THROW(app::runLink(t.session(), "0000009999", "VMCA", o, rien, false, out, err),
               app::UsageError);
  EXPECT_THROW(app::runLink(t.session(), "0000000213", "VXZ", o, rien, false, out, err),
               app::UsageError);
  // Without the right to create lines, the script's new line is refused: exit 1.
  std::istringstream nouvelle("new LST\n");
  EXPECT_EQ(app::runLink(t.session(), "0000000213", "V", o, nouvelle, false, out, err), 1);
}

}  // namespace
}  // namespace quarvo
