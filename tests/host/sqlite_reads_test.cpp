// What the SQLite database remembers of its reads, the columns an update writes, and grouped
// transactions: every read must still give what the file holds, whoever changed it.
#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <optional>
#include <thread>

#include "host/UException.h"
#include "host/table/Table.h"
#include "support/Programme.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

class SqliteReadsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    t_.sql(R"(CREATE TABLE "T_TEST" ("IDENT" TEXT NOT NULL PRIMARY KEY, "NOM" TEXT,
               "N" INTEGER DEFAULT 0, "M" DECIMAL_TEXT);
              INSERT INTO "T_TEST" VALUES ('01', 'a', 1, '1.00'), ('02', 'b', 2, '2.00');)");
  }
  // The identifiers and N of the rows named `nom`, read through a cursor.
  std::string parNom(const char* nom) {
    Table c(nullptr, "VOVOVA", "T_TEST", "LECTURE");
    c.effacerCriteres();
    c.ajouterCritere("NOM", '=', Valeur::chaine(nom));
    c.ouvrir();
    std::string out;
    while (c.lire(1) == 0) {
      out += c.valeur("IDENT").toChaine() + ":" + c.valeur("N").toChaine() + ";";
    }
    return out;
  }
  // Another connection to the same file, as another process would have.
  std::unique_ptr<SqliteDatabase> autre() {
    return std::make_unique<SqliteDatabase>(t_.dir() / "test.db", false);
  }
  test::TestSession t_;
};

TEST_F(SqliteReadsTest, ReadsInATransactionFollowOwnWritesRollbacksAndOtherConnections) {
  Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
  {
    Transaction tx(t_.db());
    EXPECT_EQ(parNom("a"), "01:1;");
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
    w.ecrire("N", Valeur::entier(10));  // not a selected column: the selection stays
    ASSERT_EQ(w.modifier(), 0);
    EXPECT_EQ(parNom("a"), "01:10;");
    w.ecrire("NOM", Valeur::chaine("b"));  // now it moves to the other selection
    ASSERT_EQ(w.modifier(), 0);
    EXPECT_EQ(parNom("a"), "");
    EXPECT_EQ(parNom("b"), "01:10;02:2;");
    w.preparer();
    w.ecrire("IDENT", Valeur::chaine("03"));
    w.ecrire("NOM", Valeur::chaine("a"));
    ASSERT_EQ(w.inserer(), 0);
    EXPECT_EQ(parNom("a"), "03:0;");
    ASSERT_EQ(w.supprimer('N'), 0);
    EXPECT_EQ(parNom("a"), "");
    tx.commit();
  }
  {
    Transaction tx(t_.db());
    EXPECT_EQ(parNom("b"), "01:10;02:2;");
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("02")), 0);
    w.ecrire("N", Valeur::entier(20));
    ASSERT_EQ(w.modifier(), 0);
    EXPECT_EQ(parNom("b"), "01:10;02:20;");
  }  // rolled back
  {
    Transaction tx(t_.db());
    EXPECT_EQ(parNom("b"), "01:10;02:2;");
    tx.commit();
  }
  autre()->execScript(R"(UPDATE "T_TEST" SET "N" = 5, "NOM" = 'c' WHERE "IDENT" = '02')");
  {
    Transaction tx(t_.db());
    EXPECT_EQ(parNom("b"), "01:10;");
    EXPECT_EQ(parNom("c"), "02:5;");
    tx.commit();
  }
  EXPECT_EQ(parNom("c"), "02:5;");  // outside a transaction too
}

// Inside a transaction a remembered row is shared by the cursors that read it instead of
// copied: each still keeps the row as it read it while another changes it, and sees the change
// once it reads the row again.
TEST_F(SqliteReadsTest, CursorsSharingARememberedRowEachKeepWhatTheyRead) {
  Transaction tx(t_.db());
  Table a(nullptr, "VOVOVA", "T_TEST", "A");
  Table b(nullptr, "VOVOVA", "T_TEST", "B");
  ASSERT_EQ(a.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
  ASSERT_EQ(b.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
  b.ecrire("N", Valeur::entier(5));
  ASSERT_EQ(b.modifier(), 0);
  b.ecrire("N", Valeur::entier(6));  // changed twice while a holds its row
  ASSERT_EQ(b.modifier(), 0);
  EXPECT_EQ(a.valeur("N").toChaine(), "1");
  a.ecrire("NOM", Valeur::chaine("z"));  // a writes only what it changed: b's N stays
  ASSERT_EQ(a.modifier(), 0);
  EXPECT_EQ(a.valeur("N").toChaine(), "1");
  ASSERT_EQ(a.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
  EXPECT_EQ(a.valeur("N").toChaine() + a.valeur("NOM").toChaine(), "6z");
  tx.commit();
  EXPECT_EQ(t_.value("T_TEST", "N", "IDENT", "01") + t_.value("T_TEST", "NOM", "IDENT", "01"),
            "6z");
}

// A whole small table read without criteria (settings, purchase accounts) is remembered like
// any selection: it must follow every row added, changed or removed, and another program's.
TEST_F(SqliteReadsTest, AWholeTableReadWithoutCriteriaFollowsEveryWrite) {
  auto tout = [] {
    Table c(nullptr, "VOVOVA", "T_TEST", "TOUT");
    c.effacerCriteres();
    c.ouvrir();
    std::string out;
    while (c.lire(1) == 0)
      out += c.valeur("IDENT").toChaine() + ":" + c.valeur("N").toChaine() + ";";
    return out;
  };
  Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
  {
    Transaction tx(t_.db());
    EXPECT_EQ(tout(), "01:1;02:2;");
    w.preparer();
    w.ecrire("IDENT", Valeur::chaine("03"));
    ASSERT_EQ(w.inserer(), 0);
    EXPECT_EQ(tout(), "01:1;02:2;03:0;");
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
    w.ecrire("N", Valeur::entier(7));
    ASSERT_EQ(w.modifier(), 0);
    EXPECT_EQ(tout(), "01:7;02:2;03:0;");
    ASSERT_EQ(w.supprimer('N'), 0);
    EXPECT_EQ(tout(), "02:2;03:0;");
  }  // rolled back
  {
    Transaction tx(t_.db());
    EXPECT_EQ(tout(), "01:1;02:2;");
    tx.commit();
  }
  autre()->execScript(R"(INSERT INTO "T_TEST" ("IDENT", "N") VALUES ('04', 4))");
  Transaction tx(t_.db());
  EXPECT_EQ(tout(), "01:1;02:2;04:4;");
}

TEST_F(SqliteReadsTest, ColumnsKeptByATriggerAreReadAgainAfterTheUpdatesThatFireIt) {
  t_.sql(R"(CREATE TABLE "T_CLE" ("IDENT" TEXT PRIMARY KEY, "NOM" TEXT, "N" INTEGER DEFAULT 0,
                                   "CLE" TEXT);
            CREATE TRIGGER "TR_T_CLE" AFTER UPDATE OF "NOM" ON "T_CLE"
            BEGIN UPDATE "T_CLE" SET "CLE" = NEW."NOM" || '|' WHERE rowid = NEW.rowid; END;
            INSERT INTO "T_CLE" VALUES ('01', 'a', 1, 'a|');)");
  Table w(nullptr, "VOVOVA", "T_CLE", "ECRITURE");
  auto parCle = [&](const char* cle) {
    Table c(nullptr, "VOVOVA", "T_CLE", "LECTURE");
    if (c.chercher(3, "CLE", '=', Valeur::chaine(cle)) != 0) return std::string("-");
    return c.valeur("NOM").toChaine() + ":" + c.valeur("N").toChaine();
  };
  Transaction tx(t_.db());
  EXPECT_EQ(parCle("a|"), "a:1");
  ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
  w.ecrire("N", Valeur::entier(2));  // fires nothing
  ASSERT_EQ(w.modifier(), 0);
  EXPECT_EQ(parCle("a|"), "a:2");
  w.ecrire("NOM", Valeur::chaine("b"));  // the trigger rewrites CLE
  ASSERT_EQ(w.modifier(), 0);
  EXPECT_EQ(parCle("a|"), "-");
  EXPECT_EQ(parCle("b|"), "b:2");
  ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
  EXPECT_EQ(w.valeur("CLE").toChaine(), "b|");
  tx.commit();
}

TEST_F(SqliteReadsTest, AnUpdateWritesOnlyTheColumnsItChanged) {
  Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
  ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
  // Someone else changes M after our read; we change N only: both changes stay.
  autre()->execScript(R"(UPDATE "T_TEST" SET "M" = '7.50' WHERE "IDENT" = '01')");
  w.ecrire("N", Valeur::entier(3));
  ASSERT_EQ(w.modifier(), 0);
  ASSERT_EQ(w.modifier(), 0);  // nothing changed since: nothing written
  EXPECT_EQ(t_.value("T_TEST", "M", "IDENT", "01"), "7.50");
  EXPECT_EQ(t_.value("T_TEST", "N", "IDENT", "01"), "3");
}

// A column written with the value it already holds is not written: its triggers do not fire
// (a record copied back whole changes only what differs). A column the file holds no value for
// is written even with its kind's default, and the next read sees the stored value, inside a
// transaction as outside.
TEST_F(SqliteReadsTest, AColumnRewrittenWithItsOwnValueIsNotWrittenButAMissingValueIs) {
  t_.sql(R"(CREATE TABLE "T_JOURNAL" ("QUI" TEXT);
            CREATE TRIGGER "TR_T_TEST_NOM" AFTER UPDATE OF "NOM" ON "T_TEST" BEGIN
              INSERT INTO "T_JOURNAL" VALUES (NEW."IDENT");
            END;
            UPDATE "T_TEST" SET "M" = NULL WHERE "IDENT" = '02';)");
  for (bool enTransaction : {false, true}) {
    std::optional<Transaction> tx;
    if (enTransaction) tx.emplace(t_.db());
    Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("02")), 0);
    w.ecrire("NOM", Valeur::chaine("b"));       // as it is
    w.ecrire("M", Valeur::monnaie(Monnaie()));  // NULL in the file: 0.00 is a change
    ASSERT_EQ(w.modifier(), 0);
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("02")), 0);
    w.ecrire("NOM", Valeur::chaine("c"));
    ASSERT_EQ(w.modifier(), 0);
    w.ecrire("NOM", Valeur::chaine("b"));
    ASSERT_EQ(w.modifier(), 0);
    if (tx) tx->commit();
  }
  EXPECT_EQ(t_.value("T_TEST", "M", "IDENT", "02"), "0.00");
  test::Lecture l(t_.dir() / "test.db");
  EXPECT_EQ(l.lignes(R"(SELECT count(*) FROM "T_TEST" WHERE "M" IS NULL)").front(), "0");
  // Two real changes of the name per pass: four rows, none for the name written as it was.
  EXPECT_EQ(l.lignes(R"(SELECT count(*) FROM "T_JOURNAL")").front(), "4");
}

// A trigger may write other tables than its own, and fire their triggers in turn: whatever a
// statement writes through them must be read again, remembered rows and selections alike,
// including when the triggers appear after the tables were first read.
TEST_F(SqliteReadsTest, TablesWrittenByTriggersAreReadAgainAfterTheStatementsThatFireThem) {
  t_.sql(R"(CREATE TABLE "T_B" ("IDENT" TEXT PRIMARY KEY, "V" INTEGER DEFAULT 0);
            CREATE TABLE "T_C" ("IDENT" TEXT PRIMARY KEY, "V" INTEGER DEFAULT 0);
            INSERT INTO "T_B" VALUES ('b1', 0); INSERT INTO "T_C" VALUES ('c1', 0);)");
  Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
  auto lire = [&](const char* table, const char* ident) {
    Table c(nullptr, "VOVOVA", table, "LECTURE");
    return c.chercher(3, "IDENT", '=', Valeur::chaine(ident)) == 0 ? c.valeur("V").toChaine()
                                                                   : std::string("-");
  };
  auto parV = [&](const char* table, int64_t v) {
    Table c(nullptr, "VOVOVA", table, "LECTURE");
    c.effacerCriteres();
    c.ajouterCritere("V", '=', Valeur::entier(v));
    c.ouvrir();
    std::string out;
    while (c.lire(1) == 0) out += c.valeur("IDENT").toChaine() + ";";
    return out;
  };
  auto ecrireN = [&](int64_t n) {
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
    w.ecrire("N", Valeur::entier(n));
    ASSERT_EQ(w.modifier(), 0);
  };
  {
    Transaction tx(t_.db());  // every table is read, and remembered, before any trigger exists
    EXPECT_EQ(lire("T_B", "b1"), "0");
    EXPECT_EQ(lire("T_C", "c1"), "0");
    ecrireN(1);
    tx.commit();
  }
  t_.sql(R"(CREATE TRIGGER "TR_T_TEST_B" AFTER UPDATE OF "N" ON "T_TEST" BEGIN
              UPDATE "T_B" SET "V" = NEW."N" WHERE "IDENT" = 'b1';
            END;
            CREATE TRIGGER "TR_T_B_C" AFTER UPDATE OF "V" ON "T_B" BEGIN
              UPDATE "T_C" SET "V" = NEW."V" * 10 WHERE "IDENT" = 'c1';
            END;
            CREATE TRIGGER "TR_T_TEST_NOUVEAU" AFTER INSERT ON "T_TEST" BEGIN
              INSERT INTO "T_B" ("IDENT", "V") VALUES (NEW."IDENT", 7);
            END;
            CREATE TRIGGER "TR_T_TEST_SUPPRIME" AFTER DELETE ON "T_TEST" BEGIN
              DELETE FROM "T_B" WHERE "IDENT" = OLD."IDENT";
            END;)");
  Transaction tx(t_.db());
  EXPECT_EQ(lire("T_B", "b1"), "0");
  EXPECT_EQ(lire("T_C", "c1"), "0");
  EXPECT_EQ(parV("T_B", 7), "");
  ecrireN(2);  // T_TEST -> T_B -> T_C
  EXPECT_EQ(lire("T_B", "b1"), "2");
  EXPECT_EQ(lire("T_C", "c1"), "20");
  w.preparer();
  w.ecrire("IDENT", Valeur::chaine("03"));
  ASSERT_EQ(w.inserer(), 0);
  EXPECT_EQ(parV("T_B", 7), "03;");
  ASSERT_EQ(w.supprimer('N'), 0);
  EXPECT_EQ(parV("T_B", 7), "");
  EXPECT_EQ(lire("T_B", "03"), "-");
  tx.commit();
}

// Inside a transaction an update of a remembered row waits in memory: every read must see it
// all the same (cursors, SQL selections and counts, scripts, triggers of other tables), a
// rolled-back savepoint must drop it, and the commit must write it.
TEST_F(SqliteReadsTest, UpdatesHeldInMemoryAreSeenByEveryReadAndDroppedByARollback) {
  t_.sql(R"(CREATE TABLE "T_COPIE" ("IDENT" TEXT, "COPIE" INTEGER);
            CREATE TRIGGER "TR_T_COPIE" AFTER INSERT ON "T_COPIE" BEGIN
              UPDATE "T_COPIE" SET "COPIE" = (SELECT "N" FROM "T_TEST" WHERE "IDENT" = '01')
               WHERE rowid = NEW.rowid;
            END;)");
  auto lecteur = autre();
  Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
  auto n01 = [&] {
    Table c(nullptr, "VOVOVA", "T_TEST", "LECTURE");
    return c.chercher(3, "IDENT", '=', Valeur::chaine("01")) == 0 ? c.valeur("N").toChaine()
                                                                  : std::string("-");
  };
  auto ecrireN = [&](int64_t n) {
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
    w.ecrire("N", Valeur::entier(n));
    ASSERT_EQ(w.modifier(), 0);
  };
  {
    Transaction tx(t_.db());
    ecrireN(10);
    ecrireN(11);
    EXPECT_EQ(n01(), "11");
    EXPECT_EQ(
        t_.db().interroger(R"(SELECT "N" FROM "T_TEST" WHERE "IDENT" = ?)", {Valeur::chaine("01")}),
        (std::vector<std::vector<std::string>>{{"11"}}));
    EXPECT_EQ(t_.db().store("T_TEST")->count({{"N", '=', Valeur::entier(11)}}), 1);
    EXPECT_EQ(parNom("a"), "01:11;");
    {
      Transaction sp(t_.db());
      ecrireN(20);
      EXPECT_EQ(n01(), "20");
    }  // the savepoint is rolled back, and the update with it
    EXPECT_EQ(n01(), "11");
    ecrireN(30);
    Table copie(nullptr, "VOVOVA", "T_COPIE", "ECRITURE");
    copie.preparer();
    copie.ecrire("IDENT", Valeur::chaine("x"));
    ASSERT_EQ(copie.inserer(), 0);  // its trigger reads T_TEST
    ASSERT_EQ(copie.chercher(3, "IDENT", '=', Valeur::chaine("x")), 0);
    EXPECT_EQ(copie.valeur("COPIE").toChaine(), "30");
    ecrireN(40);
    t_.sql(R"(UPDATE "T_TEST" SET "M" = "N" || '.00' WHERE "IDENT" = '01')");
    EXPECT_EQ(t_.value("T_TEST", "M", "IDENT", "01"), "40.00");
    ecrireN(50);
    tx.commit();
  }
  EXPECT_EQ(lecteur->store("T_TEST")->count({{"N", '=', Valeur::entier(50)}}), 1);
  {
    Transaction tx(t_.db());
    ecrireN(60);
  }  // rolled back whole
  EXPECT_EQ(n01(), "50");
  EXPECT_EQ(lecteur->store("T_TEST")->count({{"N", '=', Valeur::entier(50)}}), 1);
}

// Tests and tools read the tables in SQL through the database; that path must not become a way
// around the store's memory: a write or a transaction statement is refused.
TEST_F(SqliteReadsTest, ASqlQueryOnlyReads) {
  for (const char* sql : {R"(UPDATE "T_TEST" SET "N" = 0)", R"(SELECT 1; DELETE FROM "T_TEST")",
                          "BEGIN", "COMMIT", "PRAGMA foreign_keys = ON", "SELECT nothing"}) {
    EXPECT_THROW(t_.db().interroger(sql), UException) << sql;
  }
  EXPECT_EQ(t_.db().interroger(R"(SELECT "IDENT", "N", NULL FROM "T_TEST" ORDER BY 1)"),
            (std::vector<std::vector<std::string>>{{"01", "1", ""}, {"02", "2", ""}}));
  EXPECT_EQ(t_.db().depth(), 0);
}

TEST_F(SqliteReadsTest, GroupedUnitsAreWholeOrAbsentAndCommittedByGroups) {
  auto lecteur = autre();
  auto compter = [&] { return lecteur->store("T_TEST")->count({}); };
  auto unite = [&](const char* ident, bool garder) {
    Transaction tx(t_.db());
    Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
    w.preparer();
    w.ecrire("IDENT", Valeur::chaine(ident));
    ASSERT_EQ(w.inserer(), 0);
    if (garder) tx.commit();
  };
  {
    TransactionsGroupees groupe(t_.db(), 2, std::chrono::hours(1));
    unite("10", true);
    groupe.uniteTerminee();
    unite("11", false);  // abandoned: leaves nothing
    groupe.uniteTerminee();
    EXPECT_EQ(compter(), 3);  // the first group is committed
    unite("12", true);
    groupe.uniteTerminee();
    EXPECT_EQ(compter(), 3);  // still in the open group
    groupe.terminer();
    EXPECT_EQ(compter(), 4);
    groupe.terminer();
  }
  {
    TransactionsGroupees groupe(t_.db(), 100);
    unite("13", true);
    groupe.uniteTerminee();
  }  // cut short: the open group is rolled back, as a crash would
  EXPECT_EQ(compter(), 4);
  EXPECT_EQ(t_.db().depth(), 0);
}

// A COMMIT that SQLite refuses leaves the transaction open, as SQLite does: the store must
// not believe it closed, so that a rollback undoes the work whole (updates held in memory
// included) and the connection goes on.
TEST_F(SqliteReadsTest, ARefusedCommitLeavesTheTransactionOpenForItsRollback) {
  t_.sql(R"(PRAGMA foreign_keys = ON;
            CREATE TABLE "T_PARENT" ("IDENT" TEXT PRIMARY KEY);
            CREATE TABLE "T_ENFANT" ("IDENT" TEXT PRIMARY KEY,
              "PARENT" TEXT REFERENCES "T_PARENT" ("IDENT") DEFERRABLE INITIALLY DEFERRED);)");
  Table enfant(nullptr, "VOVOVA", "T_ENFANT", "ECRITURE");
  Table w(nullptr, "VOVOVA", "T_TEST", "ECRITURE");
  auto inserer = [](Table& table, const char* ident, const char* parent) {
    table.preparer();
    table.ecrire("IDENT", Valeur::chaine(ident));
    if (parent != nullptr) table.ecrire("PARENT", Valeur::chaine(parent));
    ASSERT_EQ(table.inserer(), 0);
  };
  {
    Transaction tx(t_.db());
    {
      Transaction sp(t_.db());
      inserer(enfant, "e1", "absent");  // checked only at COMMIT
      sp.commit();
    }
    EXPECT_EQ(t_.db().depth(), 1);
    ASSERT_EQ(w.chercher(3, "IDENT", '=', Valeur::chaine("01")), 0);
    w.ecrire("N", Valeur::entier(99));  // held in memory until the commit
    ASSERT_EQ(w.modifier(), 0);
    EXPECT_THROW(tx.commit(), UException);
    EXPECT_EQ(t_.db().depth(), 1);
  }  // rolled back
  EXPECT_EQ(t_.db().depth(), 0);
  EXPECT_EQ(t_.value("T_TEST", "N", "IDENT", "01"), "1");
  EXPECT_EQ(t_.db().store("T_ENFANT")->count({}), 0);
  {
    Transaction tx(t_.db());
    Table parent(nullptr, "VOVOVA", "T_PARENT", "ECRITURE");
    inserer(parent, "p1", nullptr);
    inserer(enfant, "e1", "p1");
    tx.commit();
  }
  EXPECT_EQ(autre()->store("T_ENFANT")->count({}), 1);
}

// The log is copied into the file by the database's own thread once a commit leaves it past
// the threshold, while writing goes on; closing leaves the file whole without the log.
TEST(SqliteCheckpointTest, TheLogIsCopiedInTheBackgroundAndNothingIsLost) {
  test::TestSession t;
  const auto chemin = t.dir() / "journal.db";
  {
    SqliteDatabase db(chemin, true, 8);
    db.execScript(R"(CREATE TABLE "T_LOG" ("IDENT" INTEGER, "TEXTE" TEXT);)");
    auto ecrire = [&](int debut, int n) {
      Transaction tx(db);
      for (int i = debut; i < debut + n; ++i) {
        db.execScript("INSERT INTO \"T_LOG\" VALUES (" + std::to_string(i) +
                      ", printf('%.*c', 3000, 'x'));");
      }
      tx.commit();
    };
    ecrire(0, 2);  // a few pages: below the threshold, no thread
    EXPECT_EQ(db.checkpointsEnFond(), 0);
    for (int k = 0; k < 20; ++k) ecrire(2 + 10 * k, 10);
    for (int attente = 0; attente < 500 && db.checkpointsEnFond() == 0; ++attente) {
      std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    EXPECT_GT(db.checkpointsEnFond(), 0);
    ecrire(202, 10);  // writing goes on after a copy
  }
  EXPECT_FALSE(std::filesystem::exists(chemin.string() + "-wal"));
  SqliteDatabase relu(chemin, false);
  EXPECT_EQ(relu.store("T_LOG")->count({}), 212);
}

}  // namespace
}  // namespace quarvo::host
