#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <set>

#include "host/automate/Automate.h"
#include "support/TestSession.h"

namespace quarvo::suite {
namespace {

using namespace host;

std::string attribuer(Session& s, const std::string& table) {
  Field ident("ID", "", "", 4, Kind::Chaine, Valeur::chaine(""), nullptr);
  EvtParamRef evt{val("VOVOVA"), val("NUMEROS"), val(table), val(""), val(10), ref(ident)};
  if (s.appelerProcedure("ZUMNDOC", "ATTRIBUE_NUMERO", &evt) != 0) return "failed";
  EvtParamRef confirm{val("VOVOVA"), val("NUMEROS"), val(table), val(""), val(10), ref(ident)};
  if (s.appelerProcedure("ZUMNDOC", "VALIDE_NUMERO", &confirm) != 0) return "unconfirmed";
  return ident.text();
}

TEST(ZumndocTest, NumbersStartAboveExistingRowsAndTakeEitherParameterOrder) {
  test::TestSession t;
  t.sql(R"(INSERT INTO "QUARVO" ("IDENT") VALUES ('0000000041'), ('0000000007'))");
  EXPECT_EQ(attribuer(t.session(), "QUARVO"), "0000000042");
  // The order used by the link document: width first, base last.
  Field ident("ID", "", "", 4, Kind::Chaine, Valeur::chaine(""), nullptr);
  EvtParamRef evt{val(10), val(""), val("QUARVO"), val("NUMEROS"), val("VOVOVA"), ref(ident)};
  EXPECT_EQ(t.session().appelerProcedure("ZUMNDOC", "ATTRIBUE_NUMERO", &evt), 0);
  EXPECT_EQ(ident.text(), "0000000043");
  // A number never given out is not confirmed.
  EvtParamVal bogus{val("VOVOVA"), val("NUMEROS"), val("QUARVO"),
                    val(""),       val(10),        val("0000009999")};
  EXPECT_EQ(t.session().appelerProcedure("ZUMNDOC", "VALIDE_NUMERO", &bogus), 1);
}

TEST(ZumndocTest, TwoProcessesNeverGetTheSameNumber) {
  test::TestSession t;
  const int perProcess = 150;
  auto dbFile = t.dir() / "test.db";
  auto outFile = t.dir() / "child.txt";
  pid_t child = fork();
  if (child == 0) {
    // The child opens its own connection, as a second program would.
    ScriptedDriver ui;
    SqliteDatabase db(dbFile, false);
    Session s(db, ui, "DEMO", "child");
    Session::Scope scope(s);
    std::ofstream out(outFile);
    for (int i = 0; i < perProcess; ++i) out << attribuer(s, "AFLBUD") << "\n";
    out.close();
    _exit(0);
  }
  std::vector<std::string> mine;
  for (int i = 0; i < perProcess; ++i) mine.push_back(attribuer(t.session(), "AFLBUD"));
  int status = 0;
  waitpid(child, &status, 0);
  ASSERT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0);
  std::set<std::string> all(mine.begin(), mine.end());
  std::ifstream in(outFile);
  std::string line;
  size_t theirs = 0;
  while (std::getline(in, line)) {
    EXPECT_EQ(line.size(), 10u) << line;
    all.insert(line);
    ++theirs;
  }
  EXPECT_EQ(theirs, static_cast<size_t>(perProcess));
  EXPECT_EQ(all.size(), static_cast<size_t>(2 * perProcess));
}

}  // namespace
}  // namespace quarvo::suite
