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
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <functional>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "support/Programme.h"

namespace quarvo {
namespace {

using namespace test;

// ---------------------------------------------------------------------------------------------
// The jobs.

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

class CrashTest : public EssaiProgramme {
 protected:
  fs::path copie(const std::string& nom, const Travail& travail) {
    return EssaiProgramme::copie(nom, travail.fichiers);
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
};

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
