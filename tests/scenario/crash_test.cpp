// Crash tests on the real program. `quarvo import` of an order file and `quarvo impute` run as
// child processes and are killed with SIGKILL at moments spread over one uninterrupted run; each
// kill must leave only whole pieces (every piece on disk as the uninterrupted run writes it,
// budget figures agreeing with the links), and a rerun on the same database must end with
// exactly what the uninterrupted run left on a copy of the same starting database: every row of
// every table (pieces, lines, links, budget lines, results, numbering counters, staging), less
// the update stamps.
//
// The CrashTest cases are short and run with the suite; the CrashTestLong cases kill more often
// on more data and carry the CTest label "long" (tests/CMakeLists.txt).
#include <fcntl.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <spawn.h>
#include <sqlite3.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <map>
#include <random>
#include <set>
#include <string>
#include <thread>
#include <vector>

extern char** environ;

namespace quarvo {
namespace {

namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

// ---------------------------------------------------------------------------------------------
// The program as a child process.

// Starts `quarvo --db DB ARGS...` with its output (stdout and stderr) in `journal`.
pid_t lancer(const fs::path& db, const std::vector<std::string>& args, const fs::path& journal) {
  std::vector<std::string> mots{QUARVO_BINARY, "--db", db.string()};
  mots.insert(mots.end(), args.begin(), args.end());
  std::vector<char*> argv;
  for (auto& m : mots) argv.push_back(m.data());
  argv.push_back(nullptr);

  std::vector<std::string> env;
  for (char** e = environ; *e != nullptr; ++e) env.emplace_back(*e);
  auto donnees = [](const std::string& e) { return e.rfind("QUARVO_DATA_DIR=", 0) == 0; };
  if (std::none_of(env.begin(), env.end(), donnees)) {
    env.push_back(std::string("QUARVO_DATA_DIR=") + QUARVO_SOURCE_DIR + "/db");
  }
  std::vector<char*> envp;
  for (auto& e : env) envp.push_back(e.data());
  envp.push_back(nullptr);

  posix_spawn_file_actions_t actions;
  posix_spawn_file_actions_init(&actions);
  posix_spawn_file_actions_addopen(&actions, 0, "/dev/null", O_RDONLY, 0);
  posix_spawn_file_actions_addopen(&actions, 1, journal.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                   0644);
  posix_spawn_file_actions_adddup2(&actions, 1, 2);
  pid_t pid = -1;
  int rc = posix_spawn(&pid, QUARVO_BINARY, &actions, nullptr, argv.data(), envp.data());
  posix_spawn_file_actions_destroy(&actions);
  return rc == 0 ? pid : -1;
}

// Waits for `pid`: its exit code, or 128 + the signal that ended it.
int attendre(pid_t pid) {
  int status = 0;
  while (waitpid(pid, &status, 0) < 0) {
    if (errno != EINTR) return -1;
  }
  return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

int executer(const fs::path& db, const std::vector<std::string>& args, const fs::path& journal) {
  pid_t pid = lancer(db, args, journal);
  return pid < 0 ? -1 : attendre(pid);
}

// Kills `pid` with SIGKILL at `moment` unless it ends before; reaps it either way.
struct Coup {
  bool enCours;  // the kill found it running
  Clock::time_point fin;
};
Coup tuer(pid_t pid, Clock::time_point moment) {
  int status = 0;
  while (Clock::now() < moment) {
    if (waitpid(pid, &status, WNOHANG) == pid) return {false, Clock::now()};
    std::this_thread::sleep_for(std::chrono::milliseconds(1));
  }
  if (waitpid(pid, &status, WNOHANG) == pid) return {false, Clock::now()};
  kill(pid, SIGKILL);
  while (waitpid(pid, &status, 0) < 0 && errno == EINTR) {
  }
  return {WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL, Clock::now()};
}

std::string lire(const fs::path& file) {
  std::ifstream in(file, std::ios::binary);
  return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// ---------------------------------------------------------------------------------------------
// What a database holds, read with SQLite itself once the processes have ended.

// Columns whose value is the time of day or the date of a run, not a result of it: the update
// stamps of pieces and links. Two uninterrupted runs of the same job differ only in these.
bool horodatage(const std::string& colonne) {
  return colonne == "DATE_MAJ" || colonne == "HEURE_MAJ";
}

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
// "TABLE<tab>values", sorted.
std::vector<std::string> etat(const fs::path& db, std::string& erreur) {
  Lecture l(db);
  std::vector<std::string> out;
  for (const auto& table : l.lignes(
           "SELECT name FROM sqlite_master WHERE type = 'table' AND name NOT LIKE 'sqlite_%'")) {
    for (auto& ligne : l.lignes("SELECT " + l.colonnes(table) + " FROM \"" + table + "\"")) {
      out.push_back(table + '\t' + ligne);
    }
  }
  std::sort(out.begin(), out.end());
  erreur = l.erreur();
  return out;
}

// The rows of `table` by the piece they belong to (`cle`, an SQL expression on the table).
using ParPiece = std::map<std::string, std::vector<std::string>>;
ParPiece parPiece(const fs::path& db, const std::string& table, const std::string& cle) {
  Lecture l(db);
  ParPiece out;
  for (auto& ligne :
       l.lignes("SELECT " + cle + ", " + l.colonnes(table) + " FROM \"" + table + "\"")) {
    auto tab = ligne.find('\t');
    out[ligne.substr(0, tab)].push_back(ligne.substr(tab + 1));
  }
  for (auto& [piece, rows] : out) std::sort(rows.begin(), rows.end());
  return out;
}

int64_t compter(const fs::path& db, const std::string& sql) {
  Lecture l(db);
  auto rows = l.lignes(sql);
  return rows.empty() ? -1 : std::stoll(rows.front());
}

// The rows of one state missing from the other: "-" those only in `a`, "+" those only in `b`.
std::vector<std::string> differences(const std::vector<std::string>& a,
                                     const std::vector<std::string>& b) {
  std::vector<std::string> moins, plus, out;
  std::set_difference(a.begin(), a.end(), b.begin(), b.end(), std::back_inserter(moins));
  std::set_difference(b.begin(), b.end(), a.begin(), a.end(), std::back_inserter(plus));
  for (auto& r : moins) out.push_back("- " + r);
  for (auto& r : plus) out.push_back("+ " + r);
  return out;
}

std::string premieres(const std::vector<std::string>& rows, size_t n = 12) {
  std::string out;
  for (size_t i = 0; i < rows.size() && i < n; ++i) out += rows[i] + "\n";
  if (rows.size() > n) out += "... " + std::to_string(rows.size() - n) + " more\n";
  return out;
}

// ---------------------------------------------------------------------------------------------
// The jobs.

// An order file of `pieces` orders of four lines (three articles and a comment line) on the
// demo company's suppliers, articles, projects and budgets, dated from February to December
// 2026. Some orders are settled, some have a requester, some lines have no budget; suppliers
// also order an article of another one (a new article-supplier row), and the services of some
// lines have no line yet in their budget (a new budget line).
std::string fichierCommandes(int pieces) {
  struct Fournisseur {
    const char* code;
    const char* articles[3];
  };
  static const Fournisseur fournisseurs[] = {
      {"ELECDIS", {"CABLE-3G2.5", "TABLEAU-ELEC", "TUBE-PER16"}},
      {"HYDROSAN", {"TUBE-PER16", "ROBINET-EQ", "CABLE-3G2.5"}},
      {"BATIMACO", {"MACO-HEURE", "MACO-HEURE", "ROBINET-EQ"}},
      {"LOCAPRO", {"NACELLE-JOUR", "NACELLE-JOUR", "TABLEAU-ELEC"}}};
  static const char* budgets[][2] = {{"AFF001", "BU26-0001"}, {"AFF002", "MANUEL"}};
  std::string out =
      "NUMERO_DOC\tDATE_CREATION\tFOURNISSEUR\tAFFAIRE\tBUDGET\tARTICLE\tDESIG\tQTE\tPUHT\t"
      "TAUX_REMISE\tTAUX_TVA\tREFERENCE\tORIGINE\tDEMANDEUR\tSOLDE\n";
  char date[16];
  for (int p = 0; p < pieces; ++p) {
    const Fournisseur& f = fournisseurs[p % 4];
    const char* affaire = budgets[(p / 4) % 2][0];
    const char* budget = budgets[(p / 4) % 2][1];
    std::snprintf(date, sizeof date, "%02d/%02d/2026", p % 28 + 1, p % 11 + 2);
    std::string debut = "CF27" + std::to_string(1000000 + p).substr(1) + '\t' + date + '\t' +
                        f.code + '\t' + affaire + '\t';
    std::string fin = "\tRéf. " + std::to_string(p) + "\t\t" + (p % 3 == 0 ? "TECH01" : "") + '\t' +
                      (p % 5 == 0 ? "1" : "0") + '\n';
    for (int l = 0; l < 3; ++l) {
      out += debut + (l == 2 && p % 7 == 0 ? "" : budget) + '\t' + f.articles[l] + "\t\t" +
             std::to_string(1 + (p + l) % 5) + '\t' + std::to_string(10 + p % 50) + ",25\t" +
             std::to_string(p % 4 * 5) + "\t20" + fin;
    }
    out += debut + "\t\tLivraison sur chantier\t0\t0\t0\t0" + fin;
  }
  return out;
}

struct Travail {
  std::string nom;
  // The command, run in `dossier` (where its database and input files are).
  std::function<std::vector<std::string>(const fs::path& dossier)> commande;
  // Input files the command consumes (the import removes a file it imported whole): a fresh
  // copy for each run; a rerun is due only while one is left.
  std::vector<std::string> fichiers;
  // Tables whose rows must be whole per piece after a kill: table and the piece's key.
  std::vector<std::pair<std::string, std::string>> pieces;
  // Counts the job's work on disk (pieces written, links written).
  std::string travailFait;
};

class CrashTest : public ::testing::Test {
 protected:
  void SetUp() override {
    std::random_device rd;
    dir_ = fs::temp_directory_path() / ("quarvo-crash-" + std::to_string(rd()));
    fs::create_directories(dir_);
  }
  void TearDown() override {
    // A failed run keeps its databases for a look.
    if (HasFailure()) {
      std::printf("databases kept in %s\n", dir_.c_str());
    } else {
      fs::remove_all(dir_);
    }
  }

  // Runs quarvo on the starting database `depart` (which it builds); fails on a non-zero exit.
  void preparer(const std::vector<std::vector<std::string>>& commandes) {
    for (const auto& args : commandes) {
      ASSERT_EQ(executer(dir_ / "depart.db", args, dir_ / "depart.txt"), 0)
          << lire(dir_ / "depart.txt");
    }
  }

  // A folder holding a fresh copy of the starting database and of the job's input files.
  fs::path copie(const std::string& nom, const Travail& travail) {
    fs::path dossier = dir_ / nom;
    fs::remove_all(dossier);
    fs::create_directories(dossier);
    fs::copy_file(dir_ / "depart.db", dossier / "q.db");
    if (fs::exists(dir_ / "depart.db-wal")) {
      fs::copy_file(dir_ / "depart.db-wal", dossier / "q.db-wal");
    }
    for (const auto& f : travail.fichiers) fs::copy_file(dir_ / f, dossier / f);
    return dossier;
  }

  // The job run once uninterrupted, then killed at `points` moments spread over that run's
  // duration, each time on a fresh copy of the starting database and followed by a rerun.
  void tuerEtReprendre(const Travail& travail, int points) {
    std::string erreur;
    fs::path ref = copie("reference", travail);
    auto debut = Clock::now();
    int code = executer(ref / "q.db", travail.commande(ref), ref / "journal.txt");
    const auto mesuree = Clock::now() - debut;
    auto duree = mesuree;
    ASSERT_EQ(code, 0) << lire(ref / "journal.txt");
    std::vector<std::string> reference = etat(ref / "q.db", erreur);
    ASSERT_EQ(erreur, "");
    std::map<std::string, ParPiece> piecesReference;
    for (const auto& [table, cle] : travail.pieces) {
      piecesReference[table] = parPiece(ref / "q.db", table, cle);
    }
    int64_t avant = compter(dir_ / "depart.db", travail.travailFait);
    int64_t apres = compter(ref / "q.db", travail.travailFait);
    ASSERT_GT(apres, avant) << "the uninterrupted run did nothing";

    int enCours = 0;     // kills that found the job running
    int partiels = 0;    // kills that left part of the job on disk
    int differents = 0;  // reruns that did not end as the uninterrupted run
    for (int i = 0; i < points; ++i) {
      fs::path k = copie("tue", travail);
      std::string ou = travail.nom + ", kill point " + std::to_string(i + 1);
      auto depart = Clock::now();
      pid_t pid = lancer(k / "q.db", travail.commande(k), k / "tue.txt");
      ASSERT_GT(pid, 0);
      Coup coup = tuer(pid, depart + duree * (2 * i + 1) / (2 * points));
      if (coup.enCours) {
        ++enCours;
      } else {
        // A run that ended before its kill was faster than the measured one (the machine is
        // shared): the next kill points are spread over this run's duration instead.
        duree = std::max<Clock::duration>(coup.fin - depart, mesuree / 2);
      }

      // What the kill left: each piece on disk (in any of the tables) as the uninterrupted
      // run wrote it in every table, budget figures that agree with the links.
      std::map<std::string, ParPiece> surDisque;
      std::set<std::string> presentes;
      for (const auto& [table, cle] : travail.pieces) {
        surDisque[table] = parPiece(k / "q.db", table, cle);
        for (const auto& entree : surDisque[table]) presentes.insert(entree.first);
      }
      bool entieres = true;  // the first piece that is not whole is shown
      for (auto piece = presentes.begin(); entieres && piece != presentes.end(); ++piece) {
        for (const auto& [table, cle] : travail.pieces) {
          if (surDisque[table][*piece] == piecesReference[table][*piece]) continue;
          EXPECT_EQ(surDisque[table][*piece], piecesReference[table][*piece])
              << ou << ": " << table << " of piece " << *piece << " is not whole";
          entieres = false;
          break;
        }
      }
      int64_t fait = compter(k / "q.db", travail.travailFait);
      if (fait > avant && fait < apres) ++partiels;
      EXPECT_EQ(executer(k / "q.db", {"check"}, k / "check.txt"), 0) << ou << ":\n"
                                                                     << lire(k / "check.txt");

      bool reste = travail.fichiers.empty();
      for (const auto& f : travail.fichiers) reste = reste || fs::exists(k / f);
      if (reste) {
        EXPECT_EQ(executer(k / "q.db", travail.commande(k), k / "reprise.txt"), 0)
            << ou << ", rerun:\n"
            << lire(k / "reprise.txt");
      }
      auto ecarts = differences(reference, etat(k / "q.db", erreur));
      ASSERT_EQ(erreur, "");
      if (!ecarts.empty()) {
        ++differents;
        ADD_FAILURE() << ou << ": after the rerun, " << ecarts.size()
                      << " rows differ from the uninterrupted run:\n"
                      << premieres(ecarts);
      }
    }
    std::printf(
        "%s: %d kill points over a run of %lld ms, %d while running (%d with part of the job on "
        "disk), %d differences\n",
        travail.nom.c_str(), points,
        static_cast<long long>(
            std::chrono::duration_cast<std::chrono::milliseconds>(mesuree).count()),
        enCours, partiels, differents);
    std::fflush(stdout);
    // Kills spread over one run's duration land mostly while the job runs; fewer would mean the
    // test proves little (the measured run was much slower than the others).
    EXPECT_GE(enCours, points / 2);
  }

  // The import of an order file of `pieces` orders (four lines each).
  void importer(int pieces, int points) {
    preparer({{"init", "--demo"}});
    std::ofstream(dir_ / "cf.txt", std::ios::binary) << fichierCommandes(pieces);
    Travail travail{"import",
                    [](const fs::path& d) {
                      return std::vector<std::string>{"import", "--cf", (d / "cf.txt").string()};
                    },
                    {"cf.txt"},
                    {{"GAPECOM", "IDENT"},
                     {"GAPLCOM", "substr(NUMERO, 1, instr(NUMERO, '|') - 1)"},
                     {"QUARVO", "COMPOSANT_IDENT"}},
                    "SELECT COUNT(*) FROM GAPECOM"};
    tuerEtReprendre(travail, points);
  }

  // The automatic imputation of `pieces` generated orders of two lines, on ten projects of five
  // budget lines (few budget lines keep `quarvo check` quick).
  void imputer(int pieces, int points) {
    preparer({{"init", "--demo"},
              {"gen", "--projects", "10", "--services", "5", "--pieces", std::to_string(pieces),
               "--lines", "2"}});
    Travail travail{"imputation",
                    [](const fs::path&) { return std::vector<std::string>{"impute"}; },
                    {},
                    {{"QUARVO", "COMPOSANT || '|' || COMPOSANT_IDENT"}},
                    "SELECT COUNT(*) FROM QUARVO"};
    tuerEtReprendre(travail, points);
  }

  fs::path dir_;
};

// The sanitizer build (unoptimised, with address and undefined-behaviour checks) runs the
// program some forty times slower: there the short cases kill it as often on a twentieth of the
// data.
#if defined(__SANITIZE_ADDRESS__)
constexpr int kReduction = 20;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
constexpr int kReduction = 20;
#else
constexpr int kReduction = 1;
#endif
#else
constexpr int kReduction = 1;
#endif

TEST_F(CrashTest, AnImportKilledAnywhereAndRerunEndsAsOneUninterruptedRun) {
  importer(1000 / kReduction, 25);
}

TEST_F(CrashTest, AnImputationKilledAnywhereAndRerunEndsAsOneUninterruptedRun) {
  imputer(1000 / kReduction, 25);
}

// The same with more kill points on more data: labelled "long".
using CrashTestLong = CrashTest;

TEST_F(CrashTestLong, AnImportKilledAnywhereAndRerunEndsAsOneUninterruptedRun) {
  importer(3000, 50);
}

TEST_F(CrashTestLong, AnImputationKilledAnywhereAndRerunEndsAsOneUninterruptedRun) {
  imputer(2500, 40);
}

}  // namespace
}  // namespace quarvo
