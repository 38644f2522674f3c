// The quarvo command as a user runs it: exit codes, messages and what reaches the database.
#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <random>

namespace {

namespace fs = std::filesystem;

struct Result {
  int code;
  std::string out;
};

class CliTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::random_device rd;
    dir_ = fs::temp_directory_path() / ("quarvo-cli-" + std::to_string(rd()));
    fs::create_directories(dir_);
    db_ = (dir_ / "q.db").string();
  }
  void TearDown() override { fs::remove_all(dir_); }

  // Runs quarvo with `args`; stdout and stderr together.
  Result quarvo(const std::string& args) {
    std::string cmd = std::string("QUARVO_DATA_DIR=") + QUARVO_SOURCE_DIR + "/db " + QUARVO_BINARY +
                      " --db " + db_ + " " + args + " 2>&1";
    FILE* p = popen(cmd.c_str(), "r");
    std::string out;
    std::array<char, 4096> buf{};
    size_t n;
    while ((n = fread(buf.data(), 1, buf.size(), p)) > 0) out.append(buf.data(), n);
    int status = pclose(p);
    return {WEXITSTATUS(status), out};
  }
  void write(const std::string& name, const std::string& text) {
    std::ofstream(dir_ / name) << text;
  }
  fs::path dir_;
  std::string db_;
};

TEST_F(CliTest, InitIsIdempotentAndRefusesForeignFiles) {
  EXPECT_EQ(quarvo("dump AFLBUD").code, 2);  // no database yet
  EXPECT_EQ(quarvo("init --demo").code, 0);
  std::string before = quarvo("dump AFLBUD").out;
  EXPECT_EQ(quarvo("init --demo").code, 0);
  EXPECT_EQ(quarvo("dump AFLBUD").out, before);  // the demo is not seeded twice

  std::ofstream(dir_ / "notes.txt") << "not a database";
  db_ = (dir_ / "notes.txt").string();
  Result r = quarvo("init");
  EXPECT_EQ(r.code, 2);
  EXPECT_NE(r.out.find("notes.txt"), std::string::npos);
  std::ifstream in(dir_ / "notes.txt");
  std::string content((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  EXPECT_EQ(content, "not a database");

  db_ = (dir_ / "other.db").string();
  std::string create = "sqlite3 " + db_ + " 'CREATE TABLE t(x)'";
  ASSERT_EQ(system(create.c_str()), 0);
  r = quarvo("init");
  EXPECT_EQ(r.code, 2);
  EXPECT_NE(r.out.find("not a QUARVO database"), std::string::npos);
}

TEST_F(CliTest, LoadAndDumpRoundTripAndBadLinesLoadNothing) {
  ASSERT_EQ(quarvo("init").code, 0);
  write(
      "chain.tsv",
      "CLE_SRC\tTYPE_DST\tIDE_DST\n-2|0000000001|1\t-3\t\"B\twith tab\"\n-2|0000000002|1\t-4\tF\n");
  Result r = quarvo("load CHAINAGE " + (dir_ / "chain.tsv").string());
  EXPECT_EQ(r.code, 0) << r.out;
  Result dump = quarvo("dump CHAINAGE");
  EXPECT_NE(dump.out.find("\"B\twith tab\""), std::string::npos) << dump.out;
  write("dump.tsv", dump.out);
  ASSERT_EQ(quarvo("init").code, 0);
  db_ = (dir_ / "second.db").string();
  ASSERT_EQ(quarvo("init").code, 0);
  ASSERT_EQ(quarvo("load CHAINAGE " + (dir_ / "dump.tsv").string()).code, 0);
  EXPECT_EQ(quarvo("dump CHAINAGE").out, dump.out);
  EXPECT_EQ(quarvo("dump CHAINAGE --where TYPE_DST=-4").out.find("B\t"), std::string::npos);

  write("bad.tsv", "CLE_SRC\tTYPE_DST\tIDE_DST\n-2|9|1\t-3\tX\n-2|9|2\ttrois\tY\n");
  r = quarvo("load CHAINAGE " + (dir_ / "bad.tsv").string());
  EXPECT_EQ(r.code, 2);
  EXPECT_NE(r.out.find("bad.tsv:3: column TYPE_DST: 'trois'"), std::string::npos) << r.out;
  EXPECT_EQ(quarvo("dump CHAINAGE").out, dump.out);  // line 2 was not kept either

  write("unknown.tsv", "CLE_SRC\tNOPE\n");
  r = quarvo("load CHAINAGE " + (dir_ / "unknown.tsv").string());
  EXPECT_EQ(r.code, 2);
  EXPECT_NE(r.out.find("no column 'NOPE'"), std::string::npos);
  EXPECT_EQ(quarvo("load NOTABLE " + (dir_ / "unknown.tsv").string()).code, 2);
}

TEST_F(CliTest, RunPrintsResultsAndOutcome) {
  ASSERT_EQ(quarvo("init --demo").code, 0);
  Result found = quarvo("run QUARVO-EXISTE_CHAINAGE_AVAL -2 0000000401 0 \"\"");
  EXPECT_EQ(found.code, 0);
  EXPECT_NE(found.out.find("2=-3\n3=0000000501\noutcome: ok"), std::string::npos) << found.out;
  Result none = quarvo("run QUARVO-EXISTE_CHAINAGE_AVAL -2 0000099999 5 x");
  EXPECT_EQ(none.code, 1);
  EXPECT_NE(none.out.find("2=0\n3=\noutcome: failed"), std::string::npos) << none.out;
  Result bad = quarvo("run QUARVO-EXISTE_CHAINAGE_AVAL deux 1 0 \"\"");
  EXPECT_EQ(bad.code, 2);
  EXPECT_NE(bad.out.find("parameter 0 ('deux')"), std::string::npos);
  EXPECT_EQ(quarvo("run QUARVO-NOTHING").code, 2);
  EXPECT_EQ(quarvo("call NOMODULE LECTURE 1").code, 2);
  // A screen's answers come from its script; a script from a file.
  write("s.txt", "set VDATEMIN 01/01/2026\npress VALID\n");
  EXPECT_EQ(quarvo("screen QUARVO-NOTHING --script " + (dir_ / "s.txt").string()).code, 2);
  EXPECT_EQ(quarvo("--answer 1 screen QUARVO-SELETAT1 --script " + (dir_ / "s.txt").string()).code,
            2);
  // The cancellation: one piece, or a selection, never both at once.
  EXPECT_EQ(quarvo("cancel CF CF26000001 --from 01/01/2026").code, 2);
  Result liste = quarvo("cancel --dry-run");
  EXPECT_EQ(liste.code, 0) << liste.out;
  Result screen = quarvo("screen QUARVO-SELETAT1 --json --script " + (dir_ / "s.txt").string());
  EXPECT_EQ(screen.code, 0) << screen.out;
  EXPECT_EQ(screen.out.rfind("{\"version\":1,\"windows\":[{\"screen\":\"SELETAT1\"", 0), 0u);
  EXPECT_NE(quarvo("automata").out.find("QUARVO-EXISTE_CHAINAGE_AVAL\n"), std::string::npos);
  // A word that names no command is named back; a company that does not exist is refused by
  // every command that runs its automata, not by those that set a database up.
  Result unknown = quarvo("frobnicate");
  EXPECT_EQ(unknown.code, 2);
  EXPECT_NE(unknown.out.find("unknown command 'frobnicate'"), std::string::npos) << unknown.out;
  for (const char* command : {"import --cf x.txt", "impute", "check", "run QUARVO-ANALYSER"}) {
    Result nope = quarvo(std::string("--company NOPE ") + command);
    EXPECT_EQ(nope.code, 2) << command;
    EXPECT_NE(nope.out.find("unknown company 'NOPE'"), std::string::npos) << nope.out;
  }
  EXPECT_EQ(quarvo("--company NOPE dump AFSOCI").code, 0);

  // A dialog's answer is a button's number, whole, or its text; anything else refuses (the
  // last button), as when no answer is left.
  const std::string choix = " call COMMUN MESS_CHOIX 1 \"\" A B C";
  EXPECT_NE(quarvo("--answer 2" + choix).out.find("1=2\n"), std::string::npos);
  EXPECT_NE(quarvo("--answer B" + choix).out.find("1=2\n"), std::string::npos);
  EXPECT_NE(quarvo("--answer 2x" + choix).out.find("1=3\n"), std::string::npos);
  EXPECT_NE(quarvo("--answer 9" + choix).out.find("1=3\n"), std::string::npos);
  EXPECT_NE(quarvo(choix).out.find("1=3\n"), std::string::npos);
}

TEST_F(CliTest, CheckFindsAPlantedDriftAndFixRemovesIt) {
  ASSERT_EQ(quarvo("init --demo").code, 0);
  std::string link =
      "sqlite3 " + db_ +
      " \"INSERT INTO QUARVO (IDENT, AFEBUD_IDENT, AFAFFA_IDENT, AFLBUD_IDENT, COMPOSANT, "
      "COMPOSANT_IDENT, PIECE, DATE_PIECE, QTE, HT) VALUES ('0000005001', '0000000201', "
      "'0000000011', '0000000211', 'GAPECOM', '0000000401', 'CF26000001', '2026-03-02', 1, "
      "'250.00')\"";
  ASSERT_EQ(system(link.c_str()), 0);
  ASSERT_EQ(quarvo("recompute 0000000211").code, 0);
  EXPECT_EQ(quarvo("check").code, 0);
  std::string drift =
      "sqlite3 " + db_ +
      " \"UPDATE AFLBUD SET VENG = '260.00', VREA = '5.00;5.00;5.00' WHERE IDENT = '0000000211'\"";
  ASSERT_EQ(system(drift.c_str()), 0);
  Result found = quarvo("check");
  EXPECT_EQ(found.code, 1);
  EXPECT_NE(found.out.find("0000000211  VENG     260.00  250.00      10.00"), std::string::npos)
      << found.out;
  EXPECT_NE(found.out.find("VREA[0]  5.00    0.00        5.00"), std::string::npos) << found.out;
  EXPECT_EQ(quarvo("check --line 0000000211 --fix").code, 1);
  EXPECT_EQ(quarvo("check").code, 0);
  EXPECT_EQ(quarvo("check --line 0000009999").code, 2);

  Result cancelled = quarvo("cancel CF CF26000001");
  EXPECT_EQ(cancelled.code, 0) << cancelled.out;
  EXPECT_NE(cancelled.out.find("0000000211   250.00            0.00"), std::string::npos)
      << cancelled.out;
  EXPECT_EQ(quarvo("check").code, 0);
  EXPECT_EQ(quarvo("cancel XX 1").code, 2);

  // A piece linked twice (its link copied onto another line, whose figures agree with it) and a
  // link to a piece that does not exist: the figures match, the links do not; --fix leaves them.
  ASSERT_EQ(quarvo("impute").code, 0);
  std::string doubled =
      "sqlite3 " + db_ +
      " \"INSERT INTO QUARVO (IDENT, AFEBUD_IDENT, AFAFFA_IDENT, AFLBUD_IDENT, COMPOSANT, "
      "COMPOSANT_IDENT, PIECE, DATE_PIECE, QTE, HT) SELECT '0000005002', AFEBUD_IDENT, "
      "AFAFFA_IDENT, '0000000212', COMPOSANT, COMPOSANT_IDENT, PIECE, DATE_PIECE, QTE, HT FROM "
      "QUARVO WHERE PIECE = 'CF26000002' LIMIT 1; INSERT INTO QUARVO (IDENT, AFEBUD_IDENT, "
      "AFAFFA_IDENT, AFLBUD_IDENT, COMPOSANT, COMPOSANT_IDENT, PIECE, DATE_PIECE, QTE, HT) VALUES "
      "('0000005003', '0000000201', '0000000011', '0000000212', 'GAPEFAC', '0000009999', "
      "'FF29999999', '2026-03-02', 1, '10.00')\"";
  ASSERT_EQ(system(doubled.c_str()), 0);
  ASSERT_EQ(quarvo("recompute 0000000212").code, 0);
  Result links = quarvo("check --fix");
  EXPECT_EQ(links.code, 1);
  EXPECT_EQ(links.out.find("differ from their links"), std::string::npos) << links.out;
  EXPECT_NE(links.out.find("GAPECOM 0000000402 (CF26000002)  amount linked beyond the piece's"),
            std::string::npos)
      << links.out;
  EXPECT_NE(links.out.find("GAPEFAC 0000009999 (FF29999999)  linked, but the piece does not exist"),
            std::string::npos)
      << links.out;
  EXPECT_EQ(quarvo("check").code, 1);  // left as they were
}

// A budget line whose budget column was changed alone disagrees with its number. Writing its
// figures no longer rewrites the number, so nothing repairs it by the way: check names it and
// --fix gives it the budget of its number.
TEST_F(CliTest, CheckNamesALineWhoseBudgetDisagreesWithItsNumber) {
  ASSERT_EQ(quarvo("init --demo").code, 0);
  std::string damage = "sqlite3 " + db_ +
                       " \"UPDATE AFLBUD SET AFEBUD_IDENT = '0000000202' WHERE IDENT = "
                       "'0000000211'\"";
  ASSERT_EQ(system(damage.c_str()), 0);
  ASSERT_EQ(quarvo("impute").code, 0);  // writes the line's figures
  Result found = quarvo("check --line 0000000211");
  EXPECT_EQ(found.code, 1);
  EXPECT_NE(found.out.find("1 budget line(s) name another budget than their number"),
            std::string::npos)
      << found.out;
  EXPECT_NE(found.out.find("0000000211  0000000201|1  0000000202  0000000201"), std::string::npos)
      << found.out;
  EXPECT_EQ(quarvo("check --line 0000000212").code, 0);
  Result fixed = quarvo("check --fix");
  EXPECT_NE(fixed.out.find("Fixed: each now names the budget of its number."), std::string::npos)
      << fixed.out;
  Result again = quarvo("check");
  EXPECT_EQ(again.code, 0) << again.out;
}

}  // namespace
