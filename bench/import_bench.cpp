// Timed import of generated purchase-order files: load, control and generation end to end on
// the demo database, against sqlite3's own ".import" of the same file into a bare table.
//
//   import_bench [LINES...]        (default: 10000 100000)
//
// Prints, per size, the seconds of each step, the total, the median time of three runs of
// "sqlite3 .import" and the ratio of the two. Needs the sqlite3 command line tool.
#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iomanip>
#include <iostream>
#include <sstream>
#include <string>
#include <vector>

#include "host/automate/Automate.h"
#include "host/session/Session.h"
#include "host/table/SqliteDatabase.h"
#include "host/ui/ScriptedDriver.h"

namespace {

using namespace quarvo;
namespace fs = std::filesystem;
using Clock = std::chrono::steady_clock;

std::string lire(const fs::path& p) {
  std::ifstream in(p);
  std::stringstream s;
  s << in.rdbuf();
  return s.str();
}

// Orders of five lines each, on the demo's suppliers, articles and budget BU26-0001.
void genererFichier(const fs::path& path, long lines) {
  std::ofstream out(path, std::ios::binary);
  out << "NUMERO_DOC\tDATE_CREATION\tFOURNISSEUR\tAFFAIRE\tBUDGET\tARTICLE\tDESIG\tQTE\tPUHT\t"
         "TAUX_REMISE\tTAUX_TVA\tREFERENCE\tORIGINE\tDEMANDEUR\tSOLDE\n";
  const char* articles[] = {"CABLE-3G2.5", "TABLEAU-ELEC", "CABLE-3G2.5", "TABLEAU-ELEC", ""};
  for (long i = 0; i < lines; ++i) {
    long piece = i / 5;
    const char* article = articles[i % 5];
    out << "CB" << std::setw(8) << std::setfill('0') << piece << "\t" << 1 + piece % 28
        << "/12/2026\tELECDIS\tAFF001\tBU26-0001\t" << article << "\t"
        << (*article ? "" : "Commentaire") << "\t" << (*article ? 1 + i % 7 : 0) << "\t"
        << (*article ? "12,50" : "0") << "\t0\t20\tCommande " << piece << "\t\tTECH01\t0\n";
  }
}

double secondes(Clock::time_point from) {
  return std::chrono::duration<double>(Clock::now() - from).count();
}

int flagOf(host::Field& f) {
  return static_cast<int>(f.entier());
}

}  // namespace

int main(int argc, char** argv) {
  std::vector<long> sizes;
  for (int i = 1; i < argc; ++i) sizes.push_back(std::atol(argv[i]));
  if (sizes.empty()) sizes = {10000, 100000};
  fs::path source = QUARVO_SOURCE_DIR;

  for (long lines : sizes) {
    fs::path dir = fs::temp_directory_path() / ("quarvo-bench-" + std::to_string(lines));
    fs::remove_all(dir);
    fs::create_directories(dir);
    fs::path file = dir / "cf.txt";
    genererFichier(file, lines);

    host::SqliteDatabase db(dir / "quarvo.db", true);
    db.execScript(lire(source / "db" / "schema.sql"));
    db.execScript("BEGIN;" + lire(source / "db" / "demo.sql") + "COMMIT;");
    host::ScriptedDriver ui;
    host::Session session(db, ui, "DEMO", "bench");
    session.setDataDir(source / "db");
    host::Session::Scope scope(session);
    host::Field flag("F", "", "", 4, host::Kind::Entier, host::Valeur::entier(0), nullptr);

    auto start = Clock::now();
    host::EvtParamRef load{host::val("IMM_PIECE_CF"), host::val(file.string()), host::val(""),
                           host::ref(flag)};
    session.appelerProcedure("COMMUN", "IMPORT_CHARGER_TXT", &load);
    double tLoad = secondes(start);
    int loadFlag = flagOf(flag);
    auto t1 = Clock::now();
    host::EvtParamRef control{host::ref(flag)};
    session.appelerModule("QUARVO-IMPORT_CONTROLER_CF", &control);
    double tControl = secondes(t1);
    int controlFlag = flagOf(flag);
    auto t2 = Clock::now();
    host::EvtParamRef generation{host::ref(flag)};
    session.appelerModule("QUARVO-IMPORT_GENERER_CF", &generation);
    double tGeneration = secondes(t2);
    double total = secondes(start);

    // The reference: sqlite3's own import of the same file into a bare table, three times into
    // a fresh file each time; the median is kept, so that one slow run does not flatter us.
    std::vector<double> imports;
    for (int essai = 0; essai < 3; ++essai) {
      fs::path bare = dir / ("bare" + std::to_string(essai) + ".db");
      std::string create =
          "sqlite3 " + bare.string() +
          " \"CREATE TABLE t(c1,c2,c3,c4,c5,c6,c7,c8,c9,c10,c11,c12,c13,c14,c15)\"";
      std::string import =
          "sqlite3 " + bare.string() + " -cmd \".mode tabs\" \".import " + file.string() + " t\"";
      if (std::system(create.c_str()) != 0) break;
      auto t3 = Clock::now();
      if (std::system(import.c_str()) != 0) break;
      imports.push_back(secondes(t3));
    }
    double tSqlite = -1;
    if (imports.size() == 3) {
      std::sort(imports.begin(), imports.end());
      tSqlite = imports[1];
    }

    std::cout << std::fixed << std::setprecision(3) << lines << " lines (" << (lines + 4) / 5
              << " orders): load " << tLoad << " s (flag " << loadFlag << "), control " << tControl
              << " s (flag " << controlFlag << "), generation " << tGeneration << " s, total "
              << total << " s";
    if (tSqlite > 0) {
      std::cout << "; sqlite3 .import " << tSqlite << " s; ratio " << std::setprecision(1)
                << total / tSqlite << "x";
    }
    std::cout << std::endl;
    fs::remove_all(dir);
  }
  return 0;
}
