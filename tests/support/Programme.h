// The quarvo program run by tests as a user runs it: child processes on a database file, killed
// when a test says so, and what a database holds read back with SQLite itself once they ended.
#pragma once

#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/types.h>

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <map>
#include <string>
#include <vector>

namespace quarvo::test {

namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

// The sanitizer build (unoptimised, with address and undefined-behaviour checks) runs the
// program some forty times slower: there tests on the program run on a twentieth of the data.
#if defined(__SANITIZE_ADDRESS__)
inline constexpr int kReduction = 20;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
inline constexpr int kReduction = 20;
#else
inline constexpr int kReduction = 1;
#endif
#else
inline constexpr int kReduction = 1;
#endif

// Starts `quarvo --db DB ARGS...` with its output (stdout and stderr) in `journal`; -1 on failure.
// `devant` is a command that runs the program (runuser and its words), when one is given.
pid_t lancer(const fs::path& db, const std::vector<std::string>& args, const fs::path& journal,
             const std::vector<std::string>& devant = {});
// Waits for `pid`: its exit code, or 128 + the signal that ended it.
int attendre(pid_t pid);
// Runs quarvo to its end: its exit code.
int executer(const fs::path& db, const std::vector<std::string>& args, const fs::path& journal);
// The same as another user of this machine (the caller being root).
int executerEnTantQue(const std::string& utilisateur, const fs::path& db,
                      const std::vector<std::string>& args, const fs::path& journal);

// Kills `pid` with SIGKILL at `moment` unless it ends before; reaps it either way.
struct Coup {
  bool enCours;  // the kill found it running
  Clock::time_point fin;
};
Coup tuer(pid_t pid, Clock::time_point moment);

std::string lire(const fs::path& file);

// Columns whose value is the time of day or the date of a run, not a result of it: the update
// stamps of pieces and links. Two uninterrupted runs of the same job differ only in these.
bool horodatage(const std::string& colonne);

// A read-only connection to a database file no program is writing.
class Lecture {
 public:
  explicit Lecture(const fs::path& db) {
    if (sqlite3_open_v2(db.c_str(), &h_, SQLITE_OPEN_READONLY, nullptr) != SQLITE_OK) {
      erreur_ = db.string() + ": " + sqlite3_errmsg(h_);
    }
  }
  ~Lecture() { sqlite3_close(h_); }
  Lecture(const Lecture&) = delete;
  Lecture& operator=(const Lecture&) = delete;

  // Rows of `sql`, values joined by tabs, NULL as \N.
  std::vector<std::string> lignes(const std::string& sql) {
    std::vector<std::string> out;
    sqlite3_stmt* st = nullptr;
    if (sqlite3_prepare_v2(h_, sql.c_str(), -1, &st, nullptr) != SQLITE_OK) {
      erreur_ = sql + ": " + sqlite3_errmsg(h_);
      return out;
    }
    while (sqlite3_step(st) == SQLITE_ROW) {
      std::string ligne;
      for (int i = 0; i < sqlite3_column_count(st); ++i) {
        const unsigned char* v = sqlite3_column_text(st, i);
        if (i > 0) ligne += '\t';
        ligne += v != nullptr ? reinterpret_cast<const char*>(v) : "\\N";
      }
      out.push_back(std::move(ligne));
    }
    sqlite3_finalize(st);
    return out;
  }

  // The columns of `table` that a run's result is made of, quoted for a SELECT.
  std::string colonnes(const std::string& table) {
    std::string liste;
    for (const auto& info : lignes("PRAGMA table_info(\"" + table + "\")")) {
      std::string nom = info.substr(info.find('\t') + 1);
      nom = nom.substr(0, nom.find('\t'));
      if (horodatage(nom)) continue;
      liste += (liste.empty() ? "\"" : ", \"") + nom + "\"";
    }
    return liste;
  }

  const std::string& erreur() const { return erreur_; }

 private:
  sqlite3* h_ = nullptr;
  std::string erreur_;
};

// Every row of every table (pieces, lines, links, budgets, results, counters, staging...), as
// "TABLE<tab>values", sorted, without the update stamps.
std::vector<std::string> etat(const fs::path& db, std::string& erreur);
// The rows of `table` by the piece they belong to (`cle`, an SQL expression on the table).
using ParPiece = std::map<std::string, std::vector<std::string>>;
ParPiece parPiece(const fs::path& db, const std::string& table, const std::string& cle);
// The first value of the first row of `sql`, as a number; -1 when there is none.
int64_t compter(const fs::path& db, const std::string& sql);
// The rows of one state missing from the other: "-" those only in `a`, "+" those only in `b`.
std::vector<std::string> differences(const std::vector<std::string>& a,
                                     const std::vector<std::string>& b);
// The first `n` rows, one a line, then how many more.
std::string premieres(const std::vector<std::string>& rows, size_t n = 12);

// An order file of `pieces` orders of four lines (three articles and a comment line) on the
// demo company's suppliers, articles, projects and budgets, dated from February to December
// 2026. Some orders are settled, some have a requester, some lines have no budget; suppliers
// also order an article of another one (a new article-supplier row), and the services of some
// lines have no line yet in their budget (a new budget line).
std::string fichierCommandes(int pieces);

// A test on the program: a folder of its own (kept when the test fails, for a look), a
// starting database built there by running commands, and fresh copies of it for each run.
class EssaiProgramme : public ::testing::Test {
 protected:
  void SetUp() override;
  void TearDown() override;
  // Runs quarvo on the starting database "depart.db" (which it builds); fails on a non-zero
  // exit.
  void preparer(const std::vector<std::vector<std::string>>& commandes);
  // A folder `nom` holding a fresh copy of the starting database (as "q.db") and of `fichiers`.
  fs::path copie(const std::string& nom, const std::vector<std::string>& fichiers = {});

  fs::path dir_;
};

}  // namespace quarvo::test
