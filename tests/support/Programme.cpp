#include "support/Programme.h"

#include <fcntl.h>
#include <signal.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <random>
#include <thread>

extern char** environ;

namespace quarvo::test {

// Starts `quarvo --db DB ARGS...` with its output (stdout and stderr) in `journal`.
pid_t lancer(const fs::path& db, const std::vector<std::string>& args, const fs::path& journal,
             const std::vector<std::string>& devant) {
  std::vector<std::string> mots = devant;
  for (const char* mot : {QUARVO_BINARY, "--db"}) mots.emplace_back(mot);
  mots.push_back(db.string());
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
  int rc = posix_spawn(&pid, mots.front().c_str(), &actions, nullptr, argv.data(), envp.data());
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

int executerEnTantQue(const std::string& utilisateur, const fs::path& db,
                      const std::vector<std::string>& args, const fs::path& journal) {
  // runuser keeps the environment it is given with -p... it resets it otherwise: the data folder
  // goes on the command line's environment through env.
  pid_t pid = lancer(db, args, journal,
                     {"/usr/sbin/runuser", "-u", utilisateur, "--", "/usr/bin/env",
                      std::string("QUARVO_DATA_DIR=") + QUARVO_SOURCE_DIR + "/db"});
  return pid < 0 ? -1 : attendre(pid);
}

// Kills `pid` with SIGKILL at `moment` unless it ends before; reaps it either way.
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

// Columns whose value is the time of day or the date of a run, not a result of it: the update
// stamps of pieces and links. Two uninterrupted runs of the same job differ only in these.
bool horodatage(const std::string& colonne) {
  return colonne == "DATE_MAJ" || colonne == "HEURE_MAJ";
}

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

std::string premieres(const std::vector<std::string>& rows, size_t n) {
  std::string out;
  for (size_t i = 0; i < rows.size() && i < n; ++i) out += rows[i] + "\n";
  if (rows.size() > n) out += "... " + std::to_string(rows.size() - n) + " more\n";
  return out;
}

void EssaiProgramme::SetUp() {
  std::random_device rd;
  dir_ =
      fs::temp_directory_path() /
      ("quarvo-" +
       std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()).substr(0, 24) +
       "-" + std::to_string(rd()));
  fs::create_directories(dir_);
}

void EssaiProgramme::TearDown() {
  // A failed run keeps its databases for a look.
  if (HasFailure()) {
    std::printf("databases kept in %s\n", dir_.c_str());
  } else {
    fs::remove_all(dir_);
  }
}

void EssaiProgramme::preparer(const std::vector<std::vector<std::string>>& commandes) {
  for (const auto& args : commandes) {
    ASSERT_EQ(executer(dir_ / "depart.db", args, dir_ / "depart.txt"), 0)
        << lire(dir_ / "depart.txt");
  }
}

fs::path EssaiProgramme::copie(const std::string& nom, const std::vector<std::string>& fichiers) {
  fs::path dossier = dir_ / nom;
  fs::remove_all(dossier);
  fs::create_directories(dossier);
  fs::copy_file(dir_ / "depart.db", dossier / "q.db");
  if (fs::exists(dir_ / "depart.db-wal")) {
    fs::copy_file(dir_ / "depart.db-wal", dossier / "q.db-wal");
  }
  for (const auto& f : fichiers) fs::copy_file(dir_ / f, dossier / f);
  return dossier;
}

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

}  // namespace quarvo::test
