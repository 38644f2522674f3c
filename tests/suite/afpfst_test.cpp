// The time pointing of a link row, as the link document opens it when it saves a link.
#include <gtest/gtest.h>

#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::suite {
namespace {

using namespace host;

TEST(AfpfstTest, ALinksPointingIsCreatedOnceAndOnlyWhenTheModesCreate) {
  test::TestSession t(true);
  t.sql(R"(INSERT INTO "QUARVO" ("IDENT", "COMPOSANT", "COMPOSANT_IDENT", "PIECE", "DATE_PIECE",
                                   "QTE", "HT")
            VALUES ('0000005001', 'AFEFFO', '0000000701', 'TE26000001', '2026-06-15', 8, '280.00'),
                   ('0000005002', 'AFEFFO', '0000000701', 'TE26000001', '2026-06-15', 4, '140.00'))");
  auto gestion = [&t](const std::string& lien, const std::string& modes) {
    EvtParamVal evt{val(lien), val(modes)};
    return t.session().appelerProcedure("AFPFST", "GESTION", &evt);
  };
  auto pointages = [](const std::string& lien) {
    Table pointage(nullptr, "VOVOVA", "AFPFST", "TEST");
    pointage.ajouterCritere("QUARVO_IDENT", '=', Valeur::chaine(lien));
    return pointage.compter();
  };
  EXPECT_EQ(gestion("0000005001", "VMC"), 0);
  EXPECT_EQ(gestion("0000005001", "VMC"), 0);
  EXPECT_EQ(pointages("0000005001"), 1);
  EXPECT_EQ(t.value("AFPFST", "QUARVO_IDENT", "IDENT", "0000001001"), "0000005001");
  EXPECT_EQ(t.value("AFPFST", "DATE_POINTAGE", "IDENT", "0000001001"), "15/06/2026");
  EXPECT_EQ(t.value("AFPFST", "QTE", "IDENT", "0000001001"), "8");
  EXPECT_EQ(t.value("AFPFST", "HT", "IDENT", "0000001001"), "280.00");
  EXPECT_EQ(gestion("0000005002", "VM"), 0);  // does not create
  EXPECT_EQ(pointages("0000005002"), 0);
  EXPECT_EQ(gestion("0000009999", "VMC"), 1);
  EXPECT_EQ(pointages("0000009999"), 0);
}

}  // namespace
}  // namespace quarvo::suite
