// What the store reads in a trigger's text: the tables its body writes, whether it writes only
// the row that fired it, and when it cannot tell.
#include <gtest/gtest.h>

#include "host/table/SqliteDeclencheur.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

// The writes of a trigger on "A" as "TABLE" or "TABLE(row)" joined by ',', or "?" when not
// understood.
std::string ecritures(const std::string& corps) {
  Declencheur d = lireDeclencheur(
      "CREATE TRIGGER \"TR\" AFTER UPDATE OF \"X\" ON \"a\" WHEN NEW.\"X\" > 0\nBEGIN\n" + corps +
          "\nEND",
      "a");
  if (!d.compris) return "?";
  std::string out;
  for (const auto& e : d.ecritures) {
    out += (out.empty() ? "" : ",") + e.table + (e.ligneDeclencheuse ? "(row)" : "");
  }
  return out;
}

TEST(SqliteTriggerTextTest, TheTablesABodyWritesAreFound) {
  EXPECT_EQ(ecritures(R"(UPDATE "A" SET "K" = NEW."X" || '|' WHERE rowid = NEW.rowid;)"), "A(row)");
  EXPECT_EQ(ecritures("update a set k = 1 where NEW.oid == _rowid_;"), "A(row)");
  // Other rows of its own table, or its row among others: the whole table.
  EXPECT_EQ(ecritures(R"(UPDATE "A" SET "K" = 1 WHERE "IDENT" = NEW."IDENT";)"), "A");
  EXPECT_EQ(ecritures("UPDATE a SET k = 1 WHERE rowid = NEW.rowid OR 1;"), "A");
  EXPECT_EQ(ecritures("UPDATE a SET k = b.k FROM b WHERE rowid = NEW.rowid;"), "A");
  EXPECT_EQ(ecritures(R"(UPDATE "B" SET "K" = 1 WHERE rowid = NEW.rowid;)"), "B");
  EXPECT_EQ(ecritures(R"(UPDATE OR REPLACE main."B" SET "K" = CASE WHEN NEW."X" THEN 1 END;
                         INSERT OR IGNORE INTO [C] VALUES (1, 'x;END;');
                         REPLACE INTO `D` SELECT * FROM "E" WHERE (SELECT 1) = 1;
                         -- UPDATE "F" in a comment writes nothing
                         DELETE FROM temp.g /* nor this: UPDATE "H" */ WHERE "K" = OLD."K";
                         SELECT RAISE(ABORT, 'no; UPDATE "I"') WHERE NEW."X" < 0;)"),
            "B,C,D,G");
  // What it cannot read, it does not guess.
  EXPECT_EQ(ecritures("WITH t AS (SELECT 1) UPDATE b SET k = 1;"), "?");
  EXPECT_EQ(ecritures("UPDATE b SET k = 'unterminated;"), "?");
  EXPECT_EQ(lireDeclencheur("CREATE TRIGGER t AFTER INSERT ON a SELECT 1;", "a").compris, false);
}

// Every trigger of the schema writes only the row that fired it: none makes a batch forget
// what it remembers, so reads stay as fast as they were.
TEST(SqliteTriggerTextTest, TheSchemaTriggersWriteOnlyTheirOwnRow) {
  test::TestSession t;
  auto declencheurs =
      t.db().interroger("SELECT tbl_name, name, sql FROM sqlite_master WHERE type = 'trigger'");
  ASSERT_FALSE(declencheurs.empty());
  for (const auto& d : declencheurs) {
    Declencheur lu = lireDeclencheur(d[2], d[0]);
    EXPECT_TRUE(lu.compris) << d[1];
    for (const auto& e : lu.ecritures) EXPECT_TRUE(e.ligneDeclencheuse) << d[1] << " " << e.table;
  }
}

}  // namespace
}  // namespace quarvo::host
