// Pointing and imputation of generated orders (5 lines each, budgets of 20 lines, ten orders
// per project): pieces per second at 1,000, 10,000 and 50,000 orders, and how the time grows
// with the number of orders (Google Benchmark's complexity fit; O(N) is the target).
//
//   cmake -S . -B build-bench -DQUARVO_BENCH=ON -DCMAKE_BUILD_TYPE=Release
//   cmake --build build-bench --target imputation_bench && build-bench/bench/imputation_bench
#include <benchmark/benchmark.h>

#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>

#include "app/GenerateCommand.h"
#include "host/table/SqliteDatabase.h"
#include "host/table/Table.h"
#include "host/ui/ScriptedDriver.h"

namespace {

using namespace quarvo;
namespace fs = std::filesystem;

std::string slurp(const fs::path& p) {
  std::ifstream in(p);
  std::ostringstream s;
  s << in.rdbuf();
  return s.str();
}

void BM_PointAndImpute(benchmark::State& state) {
  const int64_t pieces = state.range(0);
  fs::path db = fs::temp_directory_path() /
                ("quarvo-bench-" + std::to_string(std::random_device{}()) + ".db");
  fs::path data = fs::path(QUARVO_SOURCE_DIR) / "db";
  for (auto _ : state) {
    state.PauseTiming();
    fs::remove(db);
    host::SqliteDatabase database(db, true);
    database.execScript(slurp(data / "schema.sql"));
    database.execScript(slurp(data / "demo.sql"));
    host::ScriptedDriver ui;
    host::Session session(database, ui, "DEMO", "demo");
    session.setDataDir(data);
    host::Session::Scope scope(session);
    app::generate(session, {pieces / 10, pieces, 5, 20});
    state.ResumeTiming();

    session.appelerModule("QUARVO-IMPUTER_AUTO", nullptr);
    session.executerEnAttente();

    state.PauseTiming();
    host::Table links(nullptr, "VOVOVA", "QUARVO", "BENCH");
    state.counters["links"] = static_cast<double>(links.compter());
    state.ResumeTiming();
  }
  fs::remove(db);
  state.SetComplexityN(pieces);
  state.counters["pieces_per_s"] =
      benchmark::Counter(static_cast<double>(pieces), benchmark::Counter::kIsRate);
}

BENCHMARK(BM_PointAndImpute)
    ->Arg(1000)
    ->Arg(10000)
    ->Arg(50000)
    ->Iterations(1)
    ->Unit(benchmark::kSecond)
    ->UseRealTime()
    ->Complexity(benchmark::oN);

}  // namespace

BENCHMARK_MAIN();
