#include "host/automate/Seletat.h"

#include <gtest/gtest.h>

#include "host/ui/Ecran.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

std::string borne(Seletat& s, const std::string& code) {
  s.champ("VBORNE")->set(code);
  EvtParamVal e;
  s.raise("BORNE_DATE", &e);
  return s.champ("VDATEMIN")->text() + "-" + s.champ("VDATEMAX")->text() +
         (e.erreur() ? " refused" : "");
}

TEST(SeletatTest, PeriodPresetsFollowTheCompanysCurrentMonth) {
  test::TestSession t(true);  // current month 12/2026, fiscal year 2026
  Seletat s(nullptr);
  EXPECT_EQ(borne(s, "M"), "01/12/2026-31/12/2026");
  EXPECT_EQ(borne(s, "MP"), "01/11/2026-30/11/2026");
  EXPECT_EQ(borne(s, "T"), "01/10/2026-31/12/2026");
  EXPECT_EQ(borne(s, "A"), "01/01/2026-31/12/2026");
  EXPECT_EQ(borne(s, "E"), "01/01/2026-31/12/2026");
  EXPECT_EQ(borne(s, "M"), "01/12/2026-31/12/2026");
  EXPECT_EQ(borne(s, "Z"), "01/12/2026-31/12/2026 refused");  // dates left as they were
  EXPECT_EQ(s.champ("VDATEMAX")->text(), "31/12/2026");
  t.sql(R"(UPDATE "AFSOCI" SET "MOIS_ANNEE" = '022024')");
  EXPECT_EQ(borne(s, "M"), "01/02/2024-29/02/2024");
  EXPECT_EQ(borne(s, "T"), "01/01/2024-31/03/2024");
}

TEST(SeletatTest, SelectionSummaryAndCriterionLabel) {
  test::TestSession t(true);
  Seletat s(nullptr);
  s.champ("VDATEMIN")->set("01/04/2026");
  s.champ("VDATEMAX")->set("30/06/2026");
  EXPECT_EQ(s.resumeSelection("AEBV"),
            "Toutes les affaires ; Budgets de tous états ; Période du 01/04/2026 au 30/06/2026");
  s.champ("VAFFA_CHOIX")->set("A");
  s.champ("VAFFA_CODE")->set("AFF001");
  s.champ("VCLI")->set("CLI001");
  s.champ("VSERV_CHOIX")->set("U");
  s.champ("VSERV_CODE")->set("TRV");
  s.champ("VCLASSEMENT")->set("AFRPS2");
  EvtParamVal e;
  s.raise("VCLASSEMENT_LIB_FERME", &e);  // no catalogue label: the vocabulary's
  EXPECT_EQ(s.champ("VCLASSEMENT_LIB")->text(), "Conducteur de travaux");
  s.champ("VETAT")->set("NC");
  s.champ("VCLOS")->set("O");
  s.champ("VTYPE_OPT")->set("U");
  s.champ("VTYPE_CHOIX")->set("E");
  EvtParamVal parts{val("VAEB")};
  s.raise("CONSTRUIRE_VSELECTION", &parts);
  EXPECT_EQ(s.champ("VSELECTION")->text(),
            "Période du 01/04/2026 au 30/06/2026 ; Affaire AFF001, client CLI001, service TRV, "
            "classées par Conducteur de travaux ; Budgets non clôturés et clôturés dans "
            "l'exercice ; Budgets de type E");
  s.champ("VCLASSEMENT")->set("AFSERV");
  s.raise("VCLASSEMENT_LIB_FERME", &e);  // the catalogue's label
  EXPECT_EQ(s.champ("VCLASSEMENT_LIB")->text(), "Service");
  // "VALID" leads to the screen's validation.
  int validated = 0;
  s.addBranch("VALIDATION", [&](Evt*) { ++validated; });
  s.raise("VALID", &e);
  EXPECT_EQ(validated, 1);
}

}  // namespace
}  // namespace quarvo::host
