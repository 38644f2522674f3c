#include "app/Demo.h"

#include <unistd.h>

#include <deque>
#include <filesystem>
#include <fstream>
#include <ostream>

#include "app/AnalyseCommand.h"
#include "app/Console.h"
#include "app/FiguresCommand.h"
#include "app/ImportCommand.h"
#include "app/ImputeCommand.h"
#include "app/ReportCommand.h"
#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/table/Champ.h"
#include "host/table/Table.h"
#include "host/ui/TerminalDriver.h"

namespace quarvo::app {

using namespace host;
namespace fs = std::filesystem;

namespace {

// A demo folder may be replaced only when a demo made it (it holds the marker file) or it is
// empty: a folder of the user's is never removed.
constexpr const char* kMarker = ".quarvo-demo";

void prepareFolder(const fs::path& dir) {
  if (fs::exists(dir)) {
    if (!fs::is_directory(dir)) throw UsageError(dir.string() + " exists and is not a folder");
    if (!fs::exists(dir / kMarker) && !fs::is_empty(dir)) {
      throw UsageError(dir.string() + " exists and is not a QUARVO demo folder; choose --dir");
    }
    fs::remove_all(dir);
  }
  fs::create_directories(dir);
  std::ofstream(dir / kMarker) << "made by quarvo demo; the folder is replaced by the next demo\n";
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
  return "no. " + t.valeur("NUMERO_DOC").toChaine() + " of " +
         t.valeur("DATE_CREATION").toChaine() + " (identifier " + ident + ")";
}

const char* kindName(const std::string& typeCode) {
  if (typeCode == "-3") return "goods-received note";
  if (typeCode == "-4") return "supplier invoice";
  if (typeCode == "-2") return "supplier order";
  return "piece";
}

// Committed, realised and remaining figures of a project's budget lines.
void printLines(std::ostream& out, const std::string& project) {
  Table lines(nullptr, "VOVOVA", "AFLBUD", "DEMO");
  lines.chercher(3, "AFAFFA_IDENT", '=', Valeur::chaine(project));
  lines.ouvrir();
  std::vector<TextRow> rows;
  while (lines.lire(1) == 0) {
    Champ vrea("VREA", lines);
    Champ vraf("VRAF", lines);
    rows.push_back({"   " + lines.valeur("IDENT").toChaine(), lines.valeur("DESIG").toChaine(),
                    lines.valeur("VBUD_D").toChaine(), lines.valeur("VENG").toChaine(),
                    vrea.at(0).text(), vraf.at(0).text(), lines.valeur("AVT").toChaine()});
  }
  printTable(
      out, {"   Line", "Designation", "Budget", "Committed", "Realised", "Remaining", "Progress %"},
      rows);
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
      const auto* table = l.typeCible == "-3"   ? "GAPEBL"
                          : l.typeCible == "-4" ? "GAPEFAC"
                                                : "GAPECOM";
      out << "carried forward into " << kindName(l.typeCible) << " "
          << describe(s, table, l.identCible) << ".\n";
    } else {
      out << "not carried forward yet (no downstream piece).\n";
    }
    ++shown;
  }
  out << "   (from the command line: quarvo --db " << file.string()
      << " run QUARVO-EXISTE_CHAINAGE_AVAL -2 <order> 0 \"\")\n";

  out << "\n2. Can order CF26000001 be carried into the accounting link?\n";
  runAnalyse(s, "CF", "CF26000001", out);

  out << "\n3. Automatic imputation: every piece up to the end of the current month is pointed to\n"
         "   the budget lines of its project, then linked.\n";
  runImpute(s, ImputeOptions{}, out);
  out << "   Budget lines of project AFF001 afterwards:\n";
  printLines(out, "0000000011");

  out << "\n4. Do the committed and realised figures match the links behind them?\n";
  runCheck(s, std::nullopt, false, out);

  out << "\n5. The credit note AV26000001 is withdrawn from its budget line:\n";
  runCancel(s, "FF", "AV26000001", out);

  out << "\n6. Import of purchase pieces from text files (samples with a few faulty lines):\n";
  ImportOptions files;
  for (auto [kind, target] :
       {std::pair{"df", &files.df}, {"cf", &files.cf}, {"bf", &files.bf}, {"ff", &files.ff}}) {
    fs::path sample = dataDir() / "demo" / (std::string(kind) + "_achats.txt");
    fs::path copy = dir / sample.filename();
    fs::copy_file(sample, copy, fs::copy_options::overwrite_existing);
    *target = copy.string();
  }
  auto pieces = [] {
    std::vector<int64_t> n;
    for (const char* table : {"GAPEDEV", "GAPECOM", "GAPEBL", "GAPEFAC"}) {
      Table t(nullptr, "GESCOM", table, "DEMO");
      n.push_back(t.compter());
    }
    return n;
  };
  auto before = pieces();
  runImport(s, files, out);
  auto after = pieces();
  out << "   The faulty pieces above were refused; the sound ones were created and linked: "
      << after[0] - before[0] << " quote request(s), " << after[1] - before[1] << " order(s), "
      << after[2] - before[2] << " goods-received note(s), " << after[3] - before[3]
      << " invoice(s).\n";

  out << "\n7. The purchase follow-up report of the demo projects, printed and exported:\n";
  ReportPaths report = reportDemo(s, dir);
  out << "   printed:  " << report.pdf.string() << "\n   exported: " << report.exported.string()
      << "\n";

  out << "\nThe database stays in " << file.string() << "; look at it with for example\n"
      << "   quarvo --db " << file.string() << " dump AFLBUD\n"
      << "   quarvo --db " << file.string() << " check\n";
  return 0;
}

}  // namespace quarvo::app
