// The quarvo command on a database where an amount was written behind its back: the command
// stops with exit code 2 and one line on stderr naming the table, the column and the value.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>

namespace {

namespace fs = std::filesystem;

class UnreadableValueTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::random_device rd;
    dir_ = fs::temp_directory_path() / ("quarvo-valeur-" + std::to_string(rd()));
    fs::create_directories(dir_);
    db_ = (dir_ / "q.db").string();
  }
  void TearDown() override { fs::remove_all(dir_); }

  // Runs quarvo with `args`: its exit code; what it printed is in out_ and err_.
  int quarvo(const std::string& args) {
    std::string cmd = std::string("QUARVO_DATA_DIR=") + QUARVO_SOURCE_DIR + "/db " + QUARVO_BINARY +
                      " --db " + db_ + " " + args + " >" + (dir_ / "out").string() + " 2>" +
                      (dir_ / "err").string();
    int status = std::system(cmd.c_str());
    out_ = lire(dir_ / "out");
    err_ = lire(dir_ / "err");
    return WEXITSTATUS(status);
  }
  void sqlite(const std::string& sql) {
    ASSERT_EQ(std::system(("sqlite3 " + db_ + " \"" + sql + "\"").c_str()), 0);
  }
  static std::string lire(const fs::path& p) {
    std::ifstream in(p);
    std::ostringstream s;
    s << in.rdbuf();
    return s.str();
  }
  fs::path dir_;
  std::string db_;
  std::string out_;
  std::string err_;
};

TEST_F(UnreadableValueTest, AnAmountOrDateThatDoesNotReadStopsTheCommandWithOneLine) {
  ASSERT_EQ(quarvo("init --demo"), 0);
  sqlite("UPDATE AFLBUD SET VENG = '' WHERE IDENT = '0000000211'");
  ASSERT_EQ(quarvo("dump AFLBUD --where IDENT=0000000211"), 0) << err_;
  EXPECT_NE(out_.find("\t0.00\t"), std::string::npos) << out_;  // empty is no value

  sqlite("UPDATE AFLBUD SET VENG = 'abc' WHERE IDENT = '0000000211'");
  EXPECT_EQ(quarvo("dump AFLBUD"), 2);
  EXPECT_EQ(err_, "quarvo: AFLBUD.VENG: stored value 'abc' is not an amount\n");
  EXPECT_EQ(quarvo("check"), 2);
  EXPECT_EQ(err_, "quarvo: AFLBUD.VENG: stored value 'abc' is not an amount\n");

  sqlite("UPDATE AFLBUD SET VENG = '0.00', DATE_DEBUT = '2026-02-30' WHERE IDENT = '0000000211'");
  EXPECT_EQ(quarvo("dump AFLBUD"), 2);
  EXPECT_EQ(err_, "quarvo: AFLBUD.DATE_DEBUT: stored value '2026-02-30' is not a date\n");
}

}  // namespace
