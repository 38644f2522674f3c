#include <gtest/gtest.h>

#include <sstream>

#include "app/AnalyseCommand.h"
#include "app/Workspace.h"
#include "support/TestSession.h"

namespace quarvo::app {
namespace {

struct Outcome {
  int code;
  std::string out;
};

Outcome analyse(test::TestSession& t, const std::string& kind, const std::string& ident) {
  std::ostringstream out;
  int code = runAnalyse(t.session(), kind, ident, out);
  return {code, out.str()};
}

TEST(AnalyseCommandTest, PrintsOnlyTheRowsOfThisRunAndTheVerdict) {
  test::TestSession t(true);
  Outcome clean = analyse(t, "cf", "CF26000002");  // short code, document number
  EXPECT_EQ(clean.code, 0);
  EXPECT_EQ(clean.out,
            "Accounting analysis of GAPECOM 0000000402 (CF26000002)\n"
            "No error: the piece can be carried into the accounting.\n");

  t.sql(R"(INSERT INTO "IMM_ERREUR" ("IDENT", "COMPOSANT", "CODE", "DESIG", "CMT")
           VALUES ('0000000041', 'IMM_PIECE_FF', 'X1', 'Facture fournisseur no X1', 'import');
           DELETE FROM "GCPCOMPT" WHERE "CLE" = 'APORT')");
  Outcome carriage = analyse(t, "GAPECOM", "0000000402");
  EXPECT_EQ(carriage.code, 1);
  EXPECT_EQ(carriage.out,
            "Accounting analysis of GAPECOM 0000000402 (CF26000002)\n"
            "Number      Component  Code        Designation                         Comment\n"
            "0000000042  GAPECOM    CF26000002  Commande fournisseur n° CF26000002  "
            "Compte de port non défini !\n"
            "0000000043  GAPECOM    CF26000002  Commande fournisseur n° CF26000002  "
            "Poste analytique non défini pour le compte <> !\n"
            "2 errors: the piece cannot be carried into the accounting yet.\n");
  EXPECT_EQ(t.ui().transcriptText(), "");  // silent: no box

  // No purchases journal: the analysis stops at its start, which is a failure too.
  t.sql(R"(DELETE FROM "GCPCOMPT" WHERE "GENRE" = 'J')");
  Outcome journal = analyse(t, "ff", "0000000601");
  EXPECT_EQ(journal.code, 1);
  EXPECT_NE(journal.out.find("0000000044  GCPCOMPT   JL_ACHAT  Paramètrage de la liaison "
                             "comptable  Journal des achats non défini !\n"),
            std::string::npos)
      << journal.out;
  EXPECT_EQ(journal.out.find("0000000043"), std::string::npos);
}

TEST(AnalyseCommandTest, UnknownKindOrPieceIsAUsageError) {
  test::TestSession t(true);
  EXPECT_THROW(analyse(t, "DF", "0000000301"), UsageError);
  EXPECT_THROW(analyse(t, "GAPECOM", "CF99999999"), UsageError);
  EXPECT_THROW(analyse(t, "BF", "0000000401"), UsageError);  // an order, not a receipt
}

}  // namespace
}  // namespace quarvo::app
