// Values written into the SQLite file behind the runtime's back (a script, another program):
// an amount or a date the store cannot read is an error that says where it is, never a silent
// zero or empty date.
#include <gtest/gtest.h>

#include "host/UException.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

TEST(SqliteValuesTest, AStoredValueThatDoesNotReadIsAnErrorNamingTableColumnAndValue) {
  test::TestSession t;
  t.sql(R"(CREATE TABLE "T_VAL" ("IDENT" TEXT PRIMARY KEY, "M" DECIMAL_TEXT, "D" DATE_TEXT,
             "ML" DECIMAL_LIST_TEXT, "DL" DATE_LIST_TEXT);
           INSERT INTO "T_VAL" VALUES
             ('vide', '', '', '', ''), ('null', NULL, NULL, NULL, NULL),
             ('lisible', ' 12,5 ', '29/02/2024', '1.00;;-2,50', '2024-01-01;'),
             ('nombre', 7, '2024-03-01', '', ''),
             ('m', 'abc', '', '', ''), ('d', '', '2023-02-29', '', ''),
             ('ml', '', '', '1.00;x;3.00', ''), ('dl', '', '', '', '2024-01-01;31/13/2024');)");
  auto lire = [&](const char* ident) -> std::string {
    Table c(nullptr, "VOVOVA", "T_VAL", "LECTURE");
    try {
      if (c.chercher(3, "IDENT", '=', Valeur::chaine(ident)) != 0) return "-";
      std::string out;
      for (const char* col : {"M", "D", "ML", "DL"}) out += c.valeur(col).toChaine() + "|";
      return out;
    } catch (const UException& e) {
      return e.what();
    }
  };
  EXPECT_EQ(lire("vide"), "0.00||||");  // no value, as before
  EXPECT_EQ(lire("null"), "0.00||||");
  EXPECT_EQ(lire("lisible"), "12.50|29/02/2024|1.00;;-2,50|2024-01-01;|");
  EXPECT_EQ(lire("nombre"), "7.00|01/03/2024|||");
  EXPECT_EQ(lire("m"), "T_VAL.M: stored value 'abc' is not an amount");
  EXPECT_EQ(lire("d"), "T_VAL.D: stored value '2023-02-29' is not a date");
  EXPECT_EQ(lire("ml"), "T_VAL.ML: stored value '1.00;x;3.00' is not a list of amounts");
  EXPECT_EQ(lire("dl"), "T_VAL.DL: stored value '2024-01-01;31/13/2024' is not a list of dates");
  // Inside a transaction too, where rows read are remembered: the bad row is not.
  Transaction tx(t.db());
  EXPECT_EQ(lire("m"), "T_VAL.M: stored value 'abc' is not an amount");
  EXPECT_EQ(lire("m"), "T_VAL.M: stored value 'abc' is not an amount");
}

}  // namespace
}  // namespace quarvo::host
