// Two jobs on one database at once, and a database that cannot be written, with the real
// program: two imputations of the same selection started together, an import beside an
// imputation, each many times over; a dry run; a read-only database and a write lock held by
// another program. Nothing is doubled, each summary counts what its own job wrote, nothing
// fails without a word, and what cannot be done is left undone whole.
#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <random>
#include <regex>
#include <string>
#include <vector>

#include "support/Programme.h"

namespace quarvo {
namespace {

using namespace test;

// What two jobs must leave whatever their interleaving: link rows by their key (their
// identifiers depend on which job numbered them first), every budget line, the pieces and the
// counters' final values.
std::vector<std::string> resultat(const fs::path& db) {
  Lecture l(db);
  std::vector<std::string> out;
  for (const char* sql :
       {"SELECT CLE_COMPO, AFEBUD_IDENT, AFLBUD_IDENT, COMPOSANT, COMPOSANT_IDENT, QTE, QTT, HT "
        "FROM QUARVO",
        "SELECT IDENT, NUMERO, AFPRES_IDENT, VENG, VREA, VRAF, HRAF, AVT FROM AFLBUD",
        "SELECT NUMERO_DOC, HT, SOLDEE, VALIDEE FROM GAPECOM", "SELECT COUNT(*) FROM QUARVO",
        "SELECT COUNT(*) FROM GAPLCOM"}) {
    for (auto& row : l.lignes(sql)) out.push_back(row);
  }
  std::sort(out.begin(), out.end());
  EXPECT_EQ(l.erreur(), "");
  return out;
}

// "link rows written: N new" of an imputation's summary; -1 when there is none.
int64_t liensEcrits(const std::string& journal) {
  std::smatch m;
  static const std::regex summary("link rows written: ([0-9]+) new");
  return std::regex_search(journal, m, summary) ? std::stoll(m[1]) : -1;
}

// Every table, every column, every row: the database as it is, byte for byte of its values.
std::vector<std::string> toutesLesLignes(const fs::path& db) {
  Lecture l(db);
  std::vector<std::string> out;
  for (const auto& table :
       l.lignes("SELECT name FROM sqlite_master WHERE type = 'table' ORDER BY name")) {
    for (auto& row : l.lignes("SELECT * FROM \"" + table + "\"")) out.push_back(table + '\t' + row);
  }
  std::sort(out.begin(), out.end());
  return out;
}

void sql(const fs::path& db, const std::string& script) {
  sqlite3* h = nullptr;
  ASSERT_EQ(sqlite3_open(db.c_str(), &h), SQLITE_OK);
  char* err = nullptr;
  EXPECT_EQ(sqlite3_exec(h, script.c_str(), nullptr, nullptr, &err), SQLITE_OK) << err;
  sqlite3_free(err);
  sqlite3_close(h);
}

using ConcurrenceTest = EssaiProgramme;

TEST_F(ConcurrenceTest, TwoImputationsStartedTogetherLinkEveryPieceOnce) {
  preparer(
      {{"init", "--demo"},
       {"gen", "--projects", "20", "--pieces", std::to_string(300 / kReduction), "--lines", "3"}});
  fs::path ref = copie("seul");
  ASSERT_EQ(executer(ref / "q.db", {"impute"}, ref / "journal.txt"), 0);
  const auto attendu = resultat(ref / "q.db");
  const int64_t liens = liensEcrits(lire(ref / "journal.txt"));
  ASSERT_GT(liens, 0) << lire(ref / "journal.txt");

  for (int essai = 0; essai < 4; ++essai) {
    SCOPED_TRACE("run " + std::to_string(essai + 1));
    fs::path d = copie("ensemble");
    pid_t a = lancer(d / "q.db", {"impute"}, d / "a.txt");
    pid_t b = lancer(d / "q.db", {"impute"}, d / "b.txt");
    ASSERT_EQ(attendre(a), 0) << lire(d / "a.txt");
    ASSERT_EQ(attendre(b), 0) << lire(d / "b.txt");
    EXPECT_EQ(premieres(differences(attendu, resultat(d / "q.db"))), "");
    // Each summary counts its own rows: together, what one job alone writes.
    EXPECT_EQ(liensEcrits(lire(d / "a.txt")) + liensEcrits(lire(d / "b.txt")), liens)
        << lire(d / "a.txt") << lire(d / "b.txt");
    EXPECT_EQ(executer(d / "q.db", {"check"}, d / "check.txt"), 0) << lire(d / "check.txt");
  }
}

TEST_F(ConcurrenceTest, AnImportBesideAnImputationDoublesNothing) {
  preparer(
      {{"init", "--demo"},
       {"gen", "--projects", "20", "--pieces", std::to_string(200 / kReduction), "--lines", "3"}});
  std::ofstream(dir_ / "cf.txt", std::ios::binary) << fichierCommandes(150 / kReduction);
  fs::path ref = copie("seul", {"cf.txt"});
  ASSERT_EQ(executer(ref / "q.db", {"import", "--cf", (ref / "cf.txt").string()}, ref / "i.txt"), 0)
      << lire(ref / "i.txt");
  ASSERT_EQ(executer(ref / "q.db", {"impute"}, ref / "m.txt"), 0) << lire(ref / "m.txt");
  const auto attendu = resultat(ref / "q.db");

  for (int essai = 0; essai < 3; ++essai) {
    SCOPED_TRACE("run " + std::to_string(essai + 1));
    fs::path d = copie("ensemble", {"cf.txt"});
    pid_t import = lancer(d / "q.db", {"import", "--cf", (d / "cf.txt").string()}, d / "i.txt");
    pid_t impute = lancer(d / "q.db", {"impute"}, d / "m.txt");
    ASSERT_EQ(attendre(import), 0) << lire(d / "i.txt");
    ASSERT_EQ(attendre(impute), 0) << lire(d / "m.txt");
    EXPECT_EQ(premieres(differences(attendu, resultat(d / "q.db"))), "");
    EXPECT_EQ(executer(d / "q.db", {"check"}, d / "check.txt"), 0) << lire(d / "check.txt");
  }
}

TEST_F(ConcurrenceTest, ADryRunWritesNothingEvenForAChangedLinkedPiece) {
  preparer({{"init", "--demo"}, {"impute"}});
  fs::path d = copie("apercu");
  // A linked order changed since it was linked, and a service without a line in its budget, for
  // which the pointing under arbitration makes one.
  sql(d / "q.db",
      "UPDATE GAPECOM SET HEURE_MAJ = '23:59:59' WHERE IDENT = '0000000401';"
      "DELETE FROM AFLBUD WHERE IDENT = '0000000214'");
  const auto avant = toutesLesLignes(d / "q.db");
  ASSERT_EQ(executer(d / "q.db", {"impute", "--from", "01/01/2026", "--arbitration", "--dry-run"},
                     d / "apercu.txt"),
            0)
      << lire(d / "apercu.txt");
  EXPECT_NE(lire(d / "apercu.txt").find("CF26000001"), std::string::npos) << lire(d / "apercu.txt");
  EXPECT_EQ(premieres(differences(avant, toutesLesLignes(d / "q.db"))), "");
}

TEST_F(ConcurrenceTest, ADatabaseThatCannotBeWrittenEndsTheCommandAndLosesNothing) {
  preparer({{"init", "--demo"}});
  std::ofstream(dir_ / "cf.txt", std::ios::binary) << fichierCommandes(20);

  // Another program holds the write lock past the wait.
  fs::path d = copie("verrou", {"cf.txt"});
  const auto avant = toutesLesLignes(d / "q.db");
  sqlite3* autre = nullptr;
  ASSERT_EQ(sqlite3_open((d / "q.db").c_str(), &autre), SQLITE_OK);
  ASSERT_EQ(sqlite3_exec(autre, "BEGIN IMMEDIATE", nullptr, nullptr, nullptr), SQLITE_OK);
  for (const std::vector<std::string>& commande :
       {std::vector<std::string>{"--wait", "1", "import", "--cf", (d / "cf.txt").string()},
        std::vector<std::string>{"--wait", "1", "impute"}}) {
    SCOPED_TRACE(commande[2]);
    EXPECT_EQ(executer(d / "q.db", commande, d / "journal.txt"), 2) << lire(d / "journal.txt");
    std::string journal = lire(d / "journal.txt");
    EXPECT_NE(journal.find("quarvo: the database cannot be written"), std::string::npos) << journal;
    EXPECT_EQ(journal.find("sans erreur"), std::string::npos) << journal;
    EXPECT_EQ(journal.find("done"), std::string::npos) << journal;
  }
  sqlite3_exec(autre, "ROLLBACK", nullptr, nullptr, nullptr);
  sqlite3_close(autre);
  EXPECT_TRUE(fs::exists(d / "cf.txt"));
  EXPECT_EQ(premieres(differences(avant, toutesLesLignes(d / "q.db"))), "");

  // A database the user may read but not write. (Run as root, the commands run as "nobody", for
  // whom the file is read-only.)
  fs::path r = copie("lecture", {"cf.txt"});
  const auto intacte = toutesLesLignes(r / "q.db");
  // The folder stays open to all: SQLite keeps its shared-memory index beside the file.
  fs::permissions(r, fs::perms::all);
  fs::permissions(r / "q.db",
                  fs::perms::owner_read | fs::perms::group_read | fs::perms::others_read);
  if (geteuid() == 0) {
    // Another user must be able to run the program from where it was built.
    std::string essai = "runuser -u nobody -- test -x '" + std::string(QUARVO_BINARY) +
                        "' -a -r '" + std::string(QUARVO_SOURCE_DIR) + "/db/schema.sql' -a -r '" +
                        (r / "q.db").string() + "'";
    if (std::system(essai.c_str()) != 0) {
      GTEST_SKIP() << "the user nobody cannot run " << QUARVO_BINARY << " from its folder";
    }
  }
  for (const std::vector<std::string>& commande :
       {std::vector<std::string>{"import", "--cf", (r / "cf.txt").string()},
        std::vector<std::string>{"impute"}}) {
    SCOPED_TRACE(commande[0]);
    int code = geteuid() == 0 ? executerEnTantQue("nobody", r / "q.db", commande, dir_ / "ro.txt")
                              : executer(r / "q.db", commande, dir_ / "ro.txt");
    EXPECT_EQ(code, 2) << lire(dir_ / "ro.txt");
    EXPECT_NE(lire(dir_ / "ro.txt").find("quarvo: "), std::string::npos) << lire(dir_ / "ro.txt");
  }
  EXPECT_TRUE(fs::exists(r / "cf.txt"));
  EXPECT_EQ(premieres(differences(intacte, toutesLesLignes(r / "q.db"))), "");
}

}  // namespace
}  // namespace quarvo
