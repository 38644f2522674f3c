// The unattended imputation of generated orders (5 lines each, budgets of 20 lines, ten orders
// per project) against its floor: a small program with prepared statements that writes the same
// link rows, budget-line figures, results rows and counter, one transaction per order.
//
//   report: per size, the floor's and the imputation's time per piece, and their ratio
//   ("x_floor"; target 1.5 at most), at 1,000, 10,000 and 50,000 orders. The time per piece
//   staying the same from one size to the next is what linear means here.
//
// Both start from the same file: the demo company with its own pieces already imputed, then the
// generated orders, so that the orders are all there is left to impute. Before any figure is
// reported, the tables the floor wrote are compared with the imputation's, row for row; a
// difference ends the benchmark with the first row that differs.
//
//   cmake -S . -B build-bench -DQUARVO_BENCH=ON -DCMAKE_BUILD_TYPE=Release
//   cmake --build build-bench --target imputation_bench && build-bench/bench/imputation_bench
#include <benchmark/benchmark.h>
#include <fmt/format.h>
#include <sqlite3.h>
#include <time.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <map>
#include <random>
#include <set>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include "app/GenerateCommand.h"
#include "host/session/Session.h"
#include "host/table/SqliteDatabase.h"
#include "host/ui/ScriptedDriver.h"
#include "host/value/Monnaie.h"

namespace {

using namespace quarvo;
namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

std::string slurp(const fs::path& p) {
  std::ifstream in(p);
  std::ostringstream s;
  s << in.rdbuf();
  return s.str();
}

fs::path dossier() {
  static fs::path d = [] {
    fs::path p = fs::temp_directory_path() /
                 ("quarvo-imputation-bench-" + std::to_string(std::random_device{}()));
    fs::create_directories(p);
    return p;
  }();
  return d;
}

// Runs the unattended imputation on `db` with the program's own session.
void imputer(const fs::path& db) {
  fs::path data = fs::path(QUARVO_SOURCE_DIR) / "db";
  host::SqliteDatabase database(db, false);
  host::ScriptedDriver ui;
  host::Session session(database, ui, "DEMO", "demo");
  session.setDataDir(data);
  host::Session::Scope scope(session);
  session.appelerModule("QUARVO-IMPUTER_AUTO", nullptr);
  session.executerEnAttente();
}

// The starting file for `orders` orders, made once per size.
fs::path base(int64_t orders) {
  fs::path db = dossier() / ("base-" + std::to_string(orders) + ".db");
  if (fs::exists(db)) return db;
  fs::path data = fs::path(QUARVO_SOURCE_DIR) / "db";
  {
    host::SqliteDatabase database(db, true);
    database.execScript(slurp(data / "schema.sql"));
    database.execScript(slurp(data / "demo.sql"));
  }
  imputer(db);
  {
    host::SqliteDatabase database(db, false);
    host::ScriptedDriver ui;
    host::Session session(database, ui, "DEMO", "demo");
    session.setDataDir(data);
    host::Session::Scope scope(session);
    app::generate(session, {orders / 10, orders, 5, 20});
  }
  return db;
}

fs::path copie(const fs::path& from, const std::string& name) {
  fs::path to = dossier() / name;
  for (const char* suffix : {"", "-wal", "-shm"}) fs::remove(to.string() + suffix);
  fs::copy_file(from, to);
  return to;
}

// ---- The floor -------------------------------------------------------------------------------

class Connexion {
 public:
  explicit Connexion(const fs::path& db) {
    if (sqlite3_open(db.c_str(), &h_) != SQLITE_OK) throw std::runtime_error(sqlite3_errmsg(h_));
    exec(
        "PRAGMA journal_mode = WAL; PRAGMA synchronous = NORMAL; PRAGMA cache_size = -65536; "
        "PRAGMA mmap_size = 268435456;");
  }
  ~Connexion() {
    for (auto* st : statements_) sqlite3_finalize(st);
    sqlite3_close(h_);
  }
  Connexion(const Connexion&) = delete;
  Connexion& operator=(const Connexion&) = delete;

  void exec(const char* sql) {
    if (sqlite3_exec(h_, sql, nullptr, nullptr, nullptr) != SQLITE_OK) {
      throw std::runtime_error(sqlite3_errmsg(h_));
    }
  }
  sqlite3_stmt* prepare(const char* sql) {
    sqlite3_stmt* st = nullptr;
    if (sqlite3_prepare_v3(h_, sql, -1, SQLITE_PREPARE_PERSISTENT, &st, nullptr) != SQLITE_OK) {
      throw std::runtime_error(std::string(sqlite3_errmsg(h_)) + ": " + sql);
    }
    statements_.push_back(st);
    return st;
  }
  void fin(sqlite3_stmt* st) {
    if (sqlite3_step(st) != SQLITE_DONE) throw std::runtime_error(sqlite3_errmsg(h_));
    sqlite3_reset(st);
    sqlite3_clear_bindings(st);
  }

 private:
  sqlite3* h_ = nullptr;
  std::vector<sqlite3_stmt*> statements_;
};

std::string texte(sqlite3_stmt* st, int i) {
  const unsigned char* v = sqlite3_column_text(st, i);
  return v != nullptr ? reinterpret_cast<const char*>(v) : "";
}
void lier(sqlite3_stmt* st, int i, const std::string& v) {
  sqlite3_bind_text(st, i, v.c_str(), static_cast<int>(v.size()), SQLITE_TRANSIENT);
}
host::Monnaie montant(const std::string& text) {
  auto m = host::Monnaie::parse(text);
  return m ? *m : host::Monnaie();
}

// Links every order no link names yet, one transaction per order: each line to the budget line of
// the order's project whose service groups the line's article, with the line's quantity and net
// amount; the budget line's committed amount, the project's results of the piece's month and its
// budget row of the current month follow; the link counter is written once per order.
int64_t plancher(const fs::path& db) {
  Connexion c(db);
  sqlite3_stmt* commandes = c.prepare(
      R"(SELECT o."IDENT", o."NUMERO_DOC", o."DATE_CREATION", o."DATE_MAJ", o."HEURE_MAJ",
                o."SECAN_CODE"
           FROM "GAPECOM" o
          WHERE NOT EXISTS (SELECT 1 FROM "QUARVO" q
                             WHERE q."COMPOSANT" = 'GAPECOM' AND q."COMPOSANT_IDENT" = o."IDENT")
          ORDER BY o."IDENT")");
  sqlite3_stmt* lignes = c.prepare(
      R"(SELECT l."QTE", l."HT", b."IDENT", b."AFEBUD_IDENT", b."VENG", a."IDENT", a."CODE",
                p."POSTE_ACHAT", b."VBUD_D", b."VREA"
           FROM "GAPLCOM" l
           JOIN "GCPARTIC" ar ON ar."IDENT" = l."GCPARTIC_IDENT"
           JOIN "AFREGACH" g ON g."CRITERE" = 1 AND g."CLE_IDENT" = ar."GCPCRIT1_IDENT"
           JOIN "AFAFFA" a ON a."CODE" = ?2
           JOIN "AFLBUD" b ON b."AFAFFA_IDENT" = a."IDENT" AND b."AFPRES_IDENT" = g."AFPRES_IDENT"
           JOIN "AFPRES" p ON p."IDENT" = b."AFPRES_IDENT"
          WHERE l."NUMERO" >= ?1 || '|' AND l."NUMERO" < ?1 || '}'
          ORDER BY l."NUMERO")");
  sqlite3_stmt* compteur = c.prepare(
      R"(SELECT "DERNIER" FROM "ZUMNDOC"
          WHERE "MODULE" = 'QUARVO' AND "NOM" = 'NUMEROS' AND "BASE" = 'VOVOVA')");
  sqlite3_stmt* ecrireCompteur = c.prepare(
      R"(UPDATE "ZUMNDOC" SET "DERNIER" = ?
          WHERE "MODULE" = 'QUARVO' AND "NOM" = 'NUMEROS' AND "BASE" = 'VOVOVA')");
  sqlite3_stmt* lien = c.prepare(
      R"(INSERT INTO "QUARVO" ("IDENT","AFEBUD_IDENT","AFAFFA_IDENT","AFAFFA_CODE","AFLBUD_IDENT",
            "COMPOSANT","COMPOSANT_IDENT","PIECE","DATE_PIECE","QTE","QTT","HT","DATE_MAJ",
            "HEURE_MAJ","CLE_COMPO")
         VALUES (?,?,?,?,?,'GAPECOM',?,?,?,?,0.0,?,?,?,?))");
  sqlite3_stmt* engage = c.prepare(
      R"(UPDATE "AFLBUD" SET "VENG" = ?, "VREA" = ?, "VRAF" = ?, "HRAF" = 0.0, "AVT" = ?
          WHERE "IDENT" = ?)");
  sqlite3_stmt* resultat = c.prepare(
      R"(SELECT "VENG" FROM "AFRESU" WHERE "AFAFFA_IDENT" = ? AND "AFPOST_CODE" = ?
            AND "ANNEE_MOIS" = ? AND "TYPE" = 'D')");
  sqlite3_stmt* nouveauResultat = c.prepare(
      R"(INSERT INTO "AFRESU" ("AFAFFA_IDENT","AFPOST_CODE","ANNEE_MOIS","TYPE") VALUES (?,?,?,'D'))");
  sqlite3_stmt* resultatEngage = c.prepare(
      R"(UPDATE "AFRESU" SET "VENG" = ? WHERE "AFAFFA_IDENT" = ? AND "AFPOST_CODE" = ?
            AND "ANNEE_MOIS" = ? AND "TYPE" = 'D')");
  sqlite3_stmt* budgetPoste = c.prepare(
      R"(SELECT b."VBUD_D", b."VREA" FROM "AFLBUD" b JOIN "AFPRES" p ON p."IDENT" = b."AFPRES_IDENT"
          WHERE b."AFAFFA_IDENT" = ? AND p."POSTE_ACHAT" = ?)");
  sqlite3_stmt* resultatBudget = c.prepare(
      R"(UPDATE "AFRESU" SET "VBUD_D" = ?, "VREA" = ?, "VRAF_D" = ? WHERE "AFAFFA_IDENT" = ?
            AND "AFPOST_CODE" = ? AND "ANNEE_MOIS" = ? AND "TYPE" = 'D')");
  sqlite3_stmt* moisCourant = c.prepare(
      R"(SELECT substr("MOIS_ANNEE", 3) || substr("MOIS_ANNEE", 1, 2) FROM "AFSOCI" WHERE "CODE" = 'DEMO')");

  std::string courant;
  if (sqlite3_step(moisCourant) == SQLITE_ROW) courant = texte(moisCourant, 0);
  sqlite3_reset(moisCourant);

  // The results row of a key, created when missing: its committed amount.
  auto ligneResultat = [&](const std::string& projet, const std::string& poste,
                           const std::string& mois) {
    lier(resultat, 1, projet);
    lier(resultat, 2, poste);
    lier(resultat, 3, mois);
    bool trouve = sqlite3_step(resultat) == SQLITE_ROW;
    host::Monnaie veng = trouve ? montant(texte(resultat, 0)) : host::Monnaie();
    sqlite3_reset(resultat);
    if (!trouve) {
      lier(nouveauResultat, 1, projet);
      lier(nouveauResultat, 2, poste);
      lier(nouveauResultat, 3, mois);
      c.fin(nouveauResultat);
    }
    return veng;
  };

  struct Commande {
    std::string ident, numero, date, dateMaj, heureMaj, projet;
  };
  std::vector<Commande> aFaire;
  while (sqlite3_step(commandes) == SQLITE_ROW) {
    aFaire.push_back({texte(commandes, 0), texte(commandes, 1), texte(commandes, 2),
                      texte(commandes, 3), texte(commandes, 4), texte(commandes, 5)});
  }
  sqlite3_reset(commandes);

  int64_t liens = 0;
  for (const Commande& o : aFaire) {
    c.exec("BEGIN IMMEDIATE");
    sqlite3_step(compteur);
    int64_t dernier = sqlite3_column_int64(compteur, 0);
    sqlite3_reset(compteur);
    std::string mois = o.date.substr(0, 4) + o.date.substr(5, 2);
    std::set<std::pair<std::string, std::string>> postes;
    std::map<std::string, host::Monnaie> engageDansLaCommande;  // by budget line
    lier(lignes, 1, o.ident);
    lier(lignes, 2, o.projet);
    while (sqlite3_step(lignes) == SQLITE_ROW) {
      double qte = sqlite3_column_double(lignes, 0);
      host::Monnaie ht = montant(texte(lignes, 1));
      std::string ligneBudget = texte(lignes, 2), budget = texte(lignes, 3);
      host::Monnaie veng = montant(texte(lignes, 4));
      std::string projet = texte(lignes, 5), code = texte(lignes, 6), poste = texte(lignes, 7);
      std::string ident = fmt::format("{:010d}", ++dernier);
      lier(lien, 1, ident);
      lier(lien, 2, budget);
      lier(lien, 3, projet);
      lier(lien, 4, code);
      lier(lien, 5, ligneBudget);
      lier(lien, 6, o.ident);
      lier(lien, 7, o.numero);
      lier(lien, 8, o.date);
      sqlite3_bind_double(lien, 9, qte);
      lier(lien, 10, ht.text());
      lier(lien, 11, o.dateMaj);
      lier(lien, 12, o.heureMaj);
      lier(lien, 13, ligneBudget + "|GAPECOM|" + o.numero);
      c.fin(lien);
      ++liens;
      // The line's figures as the program keeps them: committed, realised (unchanged by an
      // order), what remains of the budget on each of the three and the progress.
      host::Monnaie vbud = montant(texte(lignes, 8));
      std::string vrea = texte(lignes, 9);
      host::Monnaie realise = montant(vrea.substr(0, vrea.find(';')));
      host::Monnaie reste = vbud.isZero() || vbud < realise ? host::Monnaie() : vbud - realise;
      std::string r = realise.text(), v = reste.text();
      double avt = vbud.isZero() ? 0 : ((vbud - reste) * int64_t{100} / vbud).toDouble();
      if (auto deja = engageDansLaCommande.find(ligneBudget); deja != engageDansLaCommande.end()) {
        veng = deja->second;
      }
      engageDansLaCommande[ligneBudget] = veng + ht;
      lier(engage, 1, (veng + ht).text());
      lier(engage, 2, r + ";" + r + ";" + r);
      lier(engage, 3, v + ";" + v + ";" + v);
      sqlite3_bind_double(engage, 4, std::clamp(avt, 0.0, 100.0));
      lier(engage, 5, ligneBudget);
      c.fin(engage);
      host::Monnaie dejaEngage = ligneResultat(projet, poste, mois);
      lier(resultatEngage, 1, (dejaEngage + ht).text());
      lier(resultatEngage, 2, projet);
      lier(resultatEngage, 3, poste);
      lier(resultatEngage, 4, mois);
      c.fin(resultatEngage);
      postes.insert({projet, poste});
    }
    sqlite3_reset(lignes);
    // The budget row of the current month of each post the order touched.
    for (const auto& [projet, poste] : postes) {
      host::Monnaie budget, realise;
      lier(budgetPoste, 1, projet);
      lier(budgetPoste, 2, poste);
      while (sqlite3_step(budgetPoste) == SQLITE_ROW) {
        budget += montant(texte(budgetPoste, 0));
        std::string vrea = texte(budgetPoste, 1);
        realise += montant(vrea.substr(0, vrea.find(';')));
      }
      sqlite3_reset(budgetPoste);
      ligneResultat(projet, poste, courant);
      host::Monnaie reste = budget - realise;
      lier(resultatBudget, 1, budget.text());
      lier(resultatBudget, 2, realise.text());
      lier(resultatBudget, 3, (reste < host::Monnaie() ? host::Monnaie() : reste).text());
      lier(resultatBudget, 4, projet);
      lier(resultatBudget, 5, poste);
      lier(resultatBudget, 6, courant);
      c.fin(resultatBudget);
    }
    sqlite3_bind_int64(ecrireCompteur, 1, dernier);
    c.fin(ecrireCompteur);
    c.exec("COMMIT");
  }
  return liens;
}

// ---- The comparison --------------------------------------------------------------------------

// Every row of the tables an imputation writes, sorted, as text.
std::vector<std::string> tables(const fs::path& db) {
  Connexion c(db);
  std::vector<std::string> out;
  for (const char* table : {"QUARVO", "AFLBUD", "AFRESU", "AFMOUV", "ZUMNDOC"}) {
    sqlite3_stmt* st = c.prepare(fmt::format(R"(SELECT * FROM "{}")", table).c_str());
    while (sqlite3_step(st) == SQLITE_ROW) {
      std::string ligne = table;
      for (int i = 0; i < sqlite3_column_count(st); ++i) ligne += '\t' + texte(st, i);
      out.push_back(std::move(ligne));
    }
  }
  std::sort(out.begin(), out.end());
  return out;
}

// The first row one state has and the other not, or "" when they are equal.
std::string ecart(const fs::path& a, const fs::path& b) {
  std::vector<std::string> x = tables(a), y = tables(b);
  std::vector<std::string> seulement;
  std::set_symmetric_difference(x.begin(), x.end(), y.begin(), y.end(),
                                std::back_inserter(seulement));
  if (seulement.empty()) return "";
  std::string premier = seulement.front();
  return fmt::format("{} rows differ between the floor and the imputation, first: {}",
                     seulement.size(), premier);
}

// ---- The benchmarks --------------------------------------------------------------------------

// The process's processor time: on a busy machine, wall time also counts the time others took.
double cpu() {
  timespec t{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &t);
  return static_cast<double>(t.tv_sec) + static_cast<double>(t.tv_nsec) / 1e9;
}

// Wall and processor time per piece of one run of `faire` on a fresh copy of the starting file.
struct Mesure {
  double secondes = 0;
  double cpu = 0;
};
template <typename Faire>
Mesure mesurer(benchmark::State& state, const fs::path& depart, const char* nom, Faire faire) {
  state.PauseTiming();
  fs::path db = copie(depart, nom);
  state.ResumeTiming();
  auto t0 = Clock::now();
  double c0 = cpu();
  faire(db);
  Mesure m{std::chrono::duration<double>(Clock::now() - t0).count(), cpu() - c0};
  double pieces = static_cast<double>(state.range(0));
  m.secondes /= pieces;
  m.cpu /= pieces;
  state.counters["ms_per_piece"] = 1000.0 * m.secondes;
  state.counters["cpu_ms_per_piece"] = 1000.0 * m.cpu;
  return m;
}

std::map<int64_t, Mesure> plancherParPiece;  // by size

void BM_Plancher(benchmark::State& state) {
  const int64_t pieces = state.range(0);
  fs::path depart = base(pieces);
  for (auto _ : state) {
    plancherParPiece[pieces] = mesurer(state, depart, "plancher.db", [&](const fs::path& db) {
      state.counters["links"] = static_cast<double>(plancher(db));
    });
  }
}

void BM_Imputation(benchmark::State& state) {
  const int64_t pieces = state.range(0);
  fs::path depart = base(pieces);
  for (auto _ : state) {
    fs::path imputee;
    Mesure m = mesurer(state, depart, "imputation.db", [&](const fs::path& db) {
      imputer(db);
      imputee = db;
    });
    state.PauseTiming();
    // The floor must have written what the imputation wrote, or its time means nothing.
    fs::path plancherDb = copie(depart, "plancher-controle.db");
    plancher(plancherDb);
    if (std::string e = ecart(plancherDb, imputee); !e.empty()) {
      state.SkipWithError(e.c_str());
      return;
    }
    state.ResumeTiming();
    state.counters["pieces_per_s"] = 1.0 / m.secondes;
    if (auto it = plancherParPiece.find(pieces); it != plancherParPiece.end()) {
      state.counters["x_floor"] = m.secondes / it->second.secondes;
      state.counters["x_floor_cpu"] = m.cpu / it->second.cpu;
    }
  }
}

// The same sizes for both, so that each imputation has its floor.
void tailles(benchmark::internal::Benchmark* b) {
  b->Arg(1000)->Arg(10000)->Arg(50000)->Iterations(1)->Unit(benchmark::kSecond)->UseRealTime();
}

BENCHMARK(BM_Plancher)->Apply(tailles);
BENCHMARK(BM_Imputation)->Apply(tailles);

}  // namespace

int main(int argc, char** argv) {
  benchmark::Initialize(&argc, argv);
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  fs::remove_all(dossier());
  return 0;
}
