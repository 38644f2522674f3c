// libFuzzer target of the text-file loader: any bytes, as a staged invoice file.
//
// Checks what must hold whatever the input: the loader never crashes, a load either stages
// rows and reports no fault or stages nothing (the staging table keeps its sentinel row) and
// reports at least one, never more than its bound, and every line it reads comes back as
// valid UTF-8.
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <memory>
#include <sstream>
#include <string>

#include "host/session/Session.h"
#include "host/table/SqliteDatabase.h"
#include "host/table/Table.h"
#include "host/ui/ScriptedDriver.h"
#include "suite/ImportTexte.h"

namespace {

using namespace quarvo;
namespace fs = std::filesystem;

struct Banc {
  fs::path dir;
  std::unique_ptr<host::SqliteDatabase> db;
  host::ScriptedDriver ui;
  std::unique_ptr<host::Session> session;
  std::unique_ptr<host::Session::Scope> scope;

  Banc() {
    dir = fs::temp_directory_path() / ("quarvo-fuzz-" + std::to_string(::getpid()));
    fs::create_directories(dir);
    db = std::make_unique<host::SqliteDatabase>(dir / "fuzz.db", true);
    std::ifstream in(fs::path(QUARVO_SOURCE_DIR) / "db" / "schema.sql");
    std::stringstream schema;
    schema << in.rdbuf();
    db->execScript(schema.str());
    session = std::make_unique<host::Session>(*db, ui, "DEMO", "fuzz");
    scope = std::make_unique<host::Session::Scope>(*session);
  }
};

int64_t lignesStagees() {
  host::Table t(nullptr, "VOVOVA", "IMM_PIECE_FF", "FUZZ");
  t.effacerCriteres();
  return t.compter();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  static Banc banc;
  std::string bytes(reinterpret_cast<const char*>(data), size);

  std::istringstream stream(bytes);
  suite::LecteurTexte lecteur(stream);
  std::vector<std::string> cells;
  std::string defaut;
  while (lecteur.suivante(cells, defaut)) {
    for (const auto& c : cells) {
      if (!suite::valideUtf8(c)) __builtin_trap();
    }
  }

  banc.db->execScript(R"(DELETE FROM "IMM_PIECE_FF"; DELETE FROM "IMM_ERREUR";
                         INSERT INTO "IMM_PIECE_FF" ("NUMERO_DOC") VALUES ('SENTINELLE');)");
  fs::path file = banc.dir / "ff.txt";
  {
    std::ofstream out(file, std::ios::binary);
    out << bytes;
  }
  suite::ResultatChargement r = suite::ImportTexte::charger(*banc.session, "IMM_PIECE_FF", file);
  int64_t staged = lignesStagees();
  if (r.charge) {
    if (!r.erreurs.empty() || staged != static_cast<int64_t>(r.lignes)) __builtin_trap();
  } else {
    if (r.erreurs.empty() || r.erreurs.size() > suite::ImportTexte::kErreursMax) __builtin_trap();
    if (staged != 1) __builtin_trap();
  }
  return 0;
}
