#include "host/table/Table.h"

#include <gtest/gtest.h>

#include "host/Execute.h"
#include "host/automate/Traitmnt.h"
#include "host/table/Champ.h"
#include "support/TestSession.h"

namespace quarvo::host {
namespace {

// The same cursor rules hold on a persistent table and on a memory table.
class CursorTest : public ::testing::TestWithParam<const char*> {
 protected:
  void SetUp() override {
    t_.sql(R"(CREATE TABLE "T_TEST" ("IDENT" TEXT NOT NULL PRIMARY KEY, "NOM" TEXT,
               "N" INTEGER DEFAULT 0, "M" DECIMAL_TEXT, "D" DATE_TEXT, "Q" REAL))");
    if (std::string(GetParam()) == "M_TEST") t_.session().memoire("M_TEST").setKey({"IDENT"});
    Table c(nullptr, "VOVOVA", GetParam(), "SETUP");
    // Inserted out of key order: selections must come back sorted on the key.
    for (const char* id : {"0000000123", "0000000012", "0000000120", "0000000002"}) {
      c.preparer();
      c.ecrire("IDENT", Valeur::chaine(id));
      c.ecrire("NOM", Valeur::chaine(std::string("n") + id));
      c.ecrire("N", Valeur::entier(std::stoi(std::string(id).substr(7))));
      c.ecrire("M", Valeur::chaine("10,25"));
      c.ecrire("D", Valeur::chaine("29/02/2024"));
      c.ecrire("Q", Valeur::dbl(1.5));
      ASSERT_EQ(c.inserer(), 0);
    }
  }
  std::string idents(Table& c) {
    std::string out;
    while (c.lire(1) == 0) out += c.valeur("IDENT").toChaine().substr(7) + ",";
    return out;
  }
  test::TestSession t_;
};

TEST_P(CursorTest, CriteriaAndReadModes) {
  Table c(nullptr, "VOVOVA", GetParam(), "CTX");
  c.ouvrir();
  EXPECT_EQ(idents(c), "002,012,120,123,");
  c.effacerCriteres();
  c.ajouterCritere("IDENT", '/', Valeur::chaine("000000012"), 'R');
  c.ouvrir();
  EXPECT_EQ(idents(c), "120,123,");
  EXPECT_EQ(c.lire(4), 0);
  EXPECT_EQ(c.valeur("IDENT").toChaine(), "0000000123");
  EXPECT_EQ(c.lire(3), 0);
  EXPECT_EQ(c.valeur("IDENT").toChaine(), "0000000120");
  c.effacerCriteres();
  c.ajouterCritere("N", '+', Valeur::entier(12));
  c.ajouterCritere("N", '-', Valeur::chaine("120"));
  EXPECT_EQ(c.compter(), 2);
  c.ouvrir();
  EXPECT_EQ(idents(c), "012,120,");
  EXPECT_EQ(c.chercher(3, "IDENT", '=', Valeur::chaine("0000000099")), 1);
  EXPECT_EQ(c.lire(4), 1);
  EXPECT_FALSE(c.courante());
}

TEST_P(CursorTest, ValuesKeepTheirKindAndWritesPersist) {
  Table c(nullptr, "VOVOVA", GetParam(), "CTX");
  ASSERT_EQ(c.chercher(3, "IDENT", '=', Valeur::chaine("0000000012")), 0);
  Champ m("M", c);
  Champ d("D", c);
  EXPECT_EQ(m.monnaie(), *Monnaie::parse("10.25"));
  EXPECT_EQ(d.date(), Date::of(2024, 2, 29));
  EXPECT_DOUBLE_EQ(Champ("Q", c).dbl(), 1.5);
  EXPECT_FALSE(Champ("N", c).set("douze"));  // refused, row unchanged
  m.set(m.monnaie() + *Monnaie::parse("0.005"));
  ASSERT_EQ(c.modifier(), 0);
  Table other(nullptr, "VOVOVA", GetParam(), "OTHER");
  ASSERT_EQ(other.chercher(3, "IDENT", '=', Valeur::chaine("0000000012")), 0);
  EXPECT_EQ(other.valeur("M").toChaine(), "10.255");
  EXPECT_EQ(other.supprimer('N'), 0);
  other.effacerCriteres();
  EXPECT_EQ(other.compter(), 3);
  c.effacerCriteres();
  c.ajouterCritere("N", '+', Valeur::entier(120));
  EXPECT_EQ(c.supprimerTout(), 2);
  c.effacerCriteres();
  EXPECT_EQ(c.compter(), 1);
}

INSTANTIATE_TEST_SUITE_P(SqliteAndMemory, CursorTest, ::testing::Values("T_TEST", "M_TEST"));

// A memory table lends its rows to the cursors instead of copying them: a cursor must still
// keep the row as it read it, as a copy would.
TEST_P(CursorTest, ACursorKeepsTheRowItReadWhileAnotherChangesOrRemovesIt) {
  Table a(nullptr, "VOVOVA", GetParam(), "A");
  Table b(nullptr, "VOVOVA", GetParam(), "B");
  ASSERT_EQ(a.chercher(3, "IDENT", '=', Valeur::chaine("0000000012")), 0);
  ASSERT_EQ(b.chercher(3, "IDENT", '=', Valeur::chaine("0000000012")), 0);
  b.ecrire("NOM", Valeur::chaine("changé"));
  ASSERT_EQ(b.modifier(), 0);
  EXPECT_EQ(a.valeur("NOM").toChaine(), "n0000000012");
  // Writing one column writes that one only: the other cursor's change stays.
  a.ecrire("N", Valeur::entier(99));
  ASSERT_EQ(a.modifier(), 0);
  ASSERT_EQ(b.aller(a.courantId()), 0);
  EXPECT_EQ(b.valeur("NOM").toChaine(), "changé");
  EXPECT_EQ(b.valeur("N").toChaine(), "99");
  ASSERT_EQ(b.supprimer(), 0);
  EXPECT_EQ(a.valeur("NOM").toChaine(), "n0000000012");
  // A row inserted is the cursor's current row, read back as written.
  a.preparer();
  a.ecrire("IDENT", Valeur::chaine("0000000500"));
  ASSERT_EQ(a.inserer(), 0);
  a.ecrire("N", Valeur::entier(5));
  ASSERT_EQ(a.modifier(), 0);
  ASSERT_EQ(b.chercher(3, "IDENT", '=', Valeur::chaine("0000000500")), 0);
  EXPECT_EQ(b.valeur("N").toChaine(), "5");
  EXPECT_EQ(a.valeur("IDENT").toChaine(), "0000000500");
}

TEST(TableTest, DuplicateKeysAreRefusedAndTransactionsRollBackUnlessCommitted) {
  test::TestSession t;
  Table c(nullptr, "GESCOM", "CHAINAGE", "CTX_CHAINAGE");
  auto add = [&](const char* key, int type, const char* dst) {
    c.preparer();
    c.ecrire("CLE_SRC", Valeur::chaine(key));
    c.ecrire("TYPE_DST", Valeur::entier(type));
    c.ecrire("IDE_DST", Valeur::chaine(dst));
    return c.inserer();
  };
  {
    Transaction tx(t.db());
    EXPECT_EQ(add("-2|1|1", -3, "7"), 0);
  }  // not committed: gone
  EXPECT_EQ(c.compter(), 0);
  {
    Transaction tx(t.db());
    EXPECT_EQ(add("-2|1|1", -3, "7"), 0);
    EXPECT_NE(add("-2|1|1", -3, "7"), 0);  // same key
    tx.commit();
    EXPECT_THROW(tx.commit(), UException);
  }
  EXPECT_EQ(c.compter(), 1);
}

class RecordReader : public Traitmnt {
 public:
  explicit RecordReader(Evt* evt)
      : Traitmnt(evt),
        record_(this, "VOVOVA", "I_AFLBUD", ""),
        cursor_(this, "GESCOM", "CHAINAGE", "CTX_CHAINAGE") {}
  Table record_;
  Table cursor_;
};

TEST(TableTest, InterfaceRecordsAreSharedByNameAndReachedByExpressions) {
  test::TestSession t;
  Table writer(nullptr, "VOVOVA", "I_AFLBUD", "");
  writer.ecrire("IDENT", Valeur::chaine("0000000001"));
  writer.ecrire("VENG", Valeur::chaine("12.5"));
  RecordReader r(nullptr);
  EXPECT_EQ(r.record_.valeur("VENG").toChaine(), "12.50");
  EXPECT_EQ(Execute::execute(r, "I_AFLBUD.IDENT")->toChaine(), "0000000001");
  EXPECT_EQ(Execute::execute(r, "CTX_CHAINAGE.TYPE_DST")->toChaine(), "0");
  EXPECT_FALSE(Execute::execute(r, "I_AFLBUD.NO_SUCH_COLUMN"));
  EXPECT_FALSE(Execute::execute(r, "NOWHERE.X"));
  EXPECT_EQ(Table::repSGBD(), t.dir());
}

}  // namespace
}  // namespace quarvo::host
