// Joins the SQLite store runs, and reads of one moment: what a report relies on to read many
// rows in one statement while other users keep writing.
#include <gtest/gtest.h>

#include <chrono>

#include "host/UException.h"
#include "host/table/Table.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

class SqliteJoinTest : public ::testing::Test {
 protected:
  void SetUp() override {
    t_.sql(R"(CREATE TABLE "T_PERE" ("IDENT" TEXT NOT NULL PRIMARY KEY, "JOUR" DATE_TEXT);
              CREATE TABLE "T_FILS" ("IDENT" TEXT NOT NULL PRIMARY KEY, "PERE" TEXT,
                                     "NUMERO" TEXT, "MONTANT" DECIMAL_TEXT);
              CREATE TABLE "T_LIEN" ("IDENT" TEXT NOT NULL PRIMARY KEY, "FILS" TEXT,
                                     "JOUR" DATE_TEXT);
              INSERT INTO "T_PERE" VALUES ('P2', '2026-02-01'), ('P1', '2026-01-01'),
                                          ('P3', '2026-12-01');
              INSERT INTO "T_FILS" VALUES ('F3', 'P1', 'P1|3', '3.10'), ('F1', 'P1', 'P1|1', '1'),
                                          ('F2', 'P2', 'P2|1', '2.50'), ('F9', 'P2', 'P1|9', '9'),
                                          ('F4', 'P3', 'P3|1', '4');
              INSERT INTO "T_LIEN" VALUES ('L2', 'F1', '2026-03-01'), ('L1', 'F1', '2026-01-01'),
                                          ('L3', 'F3', '2026-09-01');)");
  }

  Jointure jointure() {
    Jointure j;
    j.tables.push_back({"T_PERE", {}, {{"JOUR", '-', Valeur::chaine("30/06/2026")}}, false});
    j.tables.push_back({"T_FILS",
                        {LienJointure::egal("PERE", 0, "IDENT"),
                         LienJointure::commencePar("NUMERO", 0, "IDENT", "|")},
                        {},
                        false});
    j.tables.push_back({"T_LIEN",
                        {LienJointure::egal("FILS", 1, "IDENT")},
                        {{"JOUR", '-', Valeur::chaine("30/06/2026")}},
                        true});
    return j;
  }

  // Each row as "father child amount link", "-" for a link that is absent.
  static std::string lire(CurseurJoint& c) {
    std::string out;
    while (c.suivant()) {
      out += c.ligne(0).values[0].toChaine() + " " + c.ligne(1).values[0].toChaine() + " " +
             c.ligne(1).values[3].asMonnaie().text() + " " +
             (c.presente(2) ? c.ligne(2).values[0].toChaine() : "-") + ";";
    }
    return out;
  }

  test::TestSession t_;
};

TEST_F(SqliteJoinTest, RowsComeGroupedInKeyOrderTiedFilteredAndTyped) {
  auto c = t_.db().joindre(jointure());
  // P3 is past the date; F9 names another father; L3 is past the date, so F3 keeps its row.
  EXPECT_EQ(lire(*c), "P1 F1 1.00 L1;P1 F1 1.00 L2;P1 F3 3.10 -;P2 F2 2.50 -;");
  EXPECT_FALSE(c->suivant());

  // Two cursors on the same join read at once, each to its end.
  auto a = t_.db().joindre(jointure());
  auto b = t_.db().joindre(jointure());
  ASSERT_TRUE(a->suivant());
  EXPECT_EQ(lire(*b), "P1 F1 1.00 L1;P1 F1 1.00 L2;P1 F3 3.10 -;P2 F2 2.50 -;");
  EXPECT_EQ(lire(*a), "P1 F1 1.00 L2;P1 F3 3.10 -;P2 F2 2.50 -;");

  Jointure inconnue = jointure();
  inconnue.tables[1].liens[0].colonne = "MERE";
  EXPECT_THROW(t_.db().joindre(inconnue), UException);
  Jointure enAvant = jointure();
  enAvant.tables[1].liens[0].table = 2;
  EXPECT_THROW(t_.db().joindre(enAvant), UException);
}

TEST_F(SqliteJoinTest, ColumnsNotAskedForReadAsDefaultsAndAPartTakenIsReadAgain) {
  Jointure j = jointure();
  j.tables[1].colonnes = {"IDENT", "MONTANT"};
  auto c = t_.db().joindre(j);
  ASSERT_TRUE(c->suivant());
  EXPECT_EQ(c->ligne(1).values[2].toChaine(), "");  // NUMERO, not asked for
  EXPECT_EQ(c->ligne(1).values[3].asMonnaie().text(), "1.00");
  Row pere = std::move(c->ligne(0));
  EXPECT_EQ(pere.values[0].toChaine(), "P1");
  ASSERT_TRUE(c->suivant());  // the same father and child: the father is read again
  EXPECT_EQ(c->ligne(0).values[0].toChaine(), "P1");
  EXPECT_EQ(c->ligne(1).values[0].toChaine(), "F1");
  EXPECT_EQ(c->ligne(2).values[0].toChaine(), "L2");
  j.tables[1].colonnes = {"AUCUNE"};
  EXPECT_THROW(t_.db().joindre(j), UException);
}

TEST_F(SqliteJoinTest, AReadOfOneMomentSeesNoLaterWriteAndHoldsNoWriterBack) {
  SqliteDatabase autre(t_.dir() / "test.db", false);
  autre.delaiAttente(std::chrono::milliseconds(100));
  auto montant = [] {
    Table fils(nullptr, "VOVOVA", "T_FILS", "LECTURE");
    return fils.chercher(3, "IDENT", '=', Valeur::chaine("F1")) == 0
               ? fils.valeur("MONTANT").asMonnaie().text()
               : std::string("<none>");
  };
  {
    Lecture lecture(t_.db());
    EXPECT_EQ(montant(), "1.00");
    // Both rows change in one transaction, and it is not kept waiting.
    EXPECT_NO_THROW(autre.execScript(R"(BEGIN IMMEDIATE;
      UPDATE "T_FILS" SET "MONTANT" = '7' WHERE "IDENT" = 'F1';
      UPDATE "T_FILS" SET "MONTANT" = '8' WHERE "IDENT" = 'F2';
      COMMIT;)"));
    EXPECT_EQ(montant(), "1.00");
    auto c = t_.db().joindre(jointure());
    EXPECT_EQ(lire(*c), "P1 F1 1.00 L1;P1 F1 1.00 L2;P1 F3 3.10 -;P2 F2 2.50 -;");
  }
  EXPECT_EQ(montant(), "7.00");
  auto c = t_.db().joindre(jointure());
  EXPECT_EQ(lire(*c), "P1 F1 7.00 L1;P1 F1 7.00 L2;P1 F3 3.10 -;P2 F2 8.00 -;");

  {
    Lecture lecture(t_.db());
    EXPECT_THROW(Transaction(t_.db()), UException);
  }
  // Inside a transaction, a read of one moment is part of it.
  Transaction tx(t_.db());
  {
    Lecture lecture(t_.db());
    EXPECT_EQ(montant(), "7.00");
  }
  EXPECT_EQ(t_.db().depth(), 1);
  tx.commit();
}

}  // namespace
}  // namespace quarvo::host
