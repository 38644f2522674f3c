#include "app/Demo.h"

#include <unistd.h>

#include <deque>
#include <filesystem>
#include <ostream>

#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "host/ui/TerminalDriver.h"

namespace quarvo::app {

using namespace host;
namespace fs = std::filesystem;

namespace {

// A demo folder may be replaced only when it holds nothing but what a demo leaves there.
void prepareFolder(const fs::path& dir) {
  if (fs::exists(dir)) {
    if (!fs::is_directory(dir)) throw UsageError(dir.string() + " exists and is not a folder");
    bool ours = fs::exists(dir / "quarvo.db");
    for (const auto& entry : fs::directory_iterator(dir)) {
      std::string name = entry.path().filename().string();
      if (name.rfind("quarvo", 0) != 0 && name.rfind("demo", 0) != 0) ours = false;
    }
    if (!ours && !fs::is_empty(dir)) {
      throw UsageError(dir.string() + " exists and is not a QUARVO demo folder; choose --dir");
    }
    fs::remove_all(dir);
  }
  fs::create_directories(dir);
}

struct Lookup {
  std::string typeCible;
  std::string identCible;
  int outcome;
};

Lookup chainingOf(Session& s, const std::string& orderIdent) {
  Field type("TYPE", "", "", 4, Kind::Chaine, Valeur::chaine("-2"), nullptr);
  Field ident("IDENT", "", "", 4, Kind::Chaine, Valeur::chaine(orderIdent), nullptr);
  Field typeCible("TYPE_CIBLE", "", "", 4, Kind::Chaine, Valeur::chaine("0"), nullptr);
  Field identCible("IDENT_CIBLE", "", "", 4, Kind::Chaine, Valeur::chaine(""), nullptr);
  EvtParamRef evt({&type, &ident, &typeCible, &identCible});
  AutomatePtr a = s.creer("QUARVO-EXISTE_CHAINAGE_AVAL", &evt);
  a->executer(&evt);
  return {typeCible.text(), identCible.text(), a->outcome()};
}

std::string describe(Session&, const std::string& table, const std::string& ident) {
  Table t(nullptr, "GESCOM", table, "DEMO");
  if (t.chercher(3, "IDENT", '=', Valeur::chaine(ident)) != 0) return table + " " + ident;
  return "no. " + t.valeur("NUMERO_DOC").toChaine() + " of " + t.valeur("DATE_CREATION").toChaine() +
         " (identifier " + ident + ")";
}

const char* kindName(const std::string& typeCode) {
  if (typeCode == "-3") return "goods-received note";
  if (typeCode == "-4") return "supplier invoice";
  if (typeCode == "-2") return "supplier order";
  return "piece";
}

}  // namespace

int runDemo(const std::string& dirText, std::ostream& out, std::ostream& err) {
  fs::path dir(dirText);
  prepareFolder(dir);
  fs::path file = dir / "quarvo.db";
  auto ws = Workspace::init(file);
  ws->seedDemo();
  TerminalDriver ui(err, {}, isatty(STDERR_FILENO) != 0);
  Session& s = ws->startSession(ui, "DEMO", "demo");
  Session::Scope scope(s);

  out << "QUARVO demo: a small company with projects, budgets and purchases was created in "
      << file.string() << ".\n\n";
  out << "1. Has a supplier order been carried forward into a later piece?\n";
  Table orders(nullptr, "GESCOM", "GAPECOM", "DEMO");
  orders.ouvrir();
  int shown = 0;
  while (orders.lire(1) == 0 && shown < 4) {
    std::string ident = orders.valeur("IDENT").toChaine();
    Lookup l = chainingOf(s, ident);
    out << "   Order " << describe(s, "GAPECOM", ident) << ": ";
    if (l.outcome == 0) {
      const auto* table = l.typeCible == "-3" ? "GAPEBL" : l.typeCible == "-4" ? "GAPEFAC" : "GAPECOM";
      out << "carried forward into " << kindName(l.typeCible) << " "
          << describe(s, table, l.identCible) << ".\n";
    } else {
      out << "not carried forward yet (no downstream piece).\n";
    }
    ++shown;
  }
  out << "\nThe same lookup from the command line:\n"
      << "   quarvo --db " << file.string() << " run QUARVO-EXISTE_CHAINAGE_AVAL -2 <order> 0 \"\"\n"
      << "\nThe database stays in " << file.string() << "; look at it with for example\n"
      << "   quarvo --db " << file.string() << " dump AFLBUD\n";
  return 0;
}

}  // namespace quarvo::app
