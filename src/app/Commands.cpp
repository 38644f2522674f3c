#include "app/Commands.h"

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <deque>
#include <fstream>
#include <iostream>
#include <optional>

#include "app/AnalyseCommand.h"
#include "app/Demo.h"
#include "app/FiguresCommand.h"
#include "app/GenerateCommand.h"
#include "app/ImportCommand.h"
#include "app/ImputeCommand.h"
#include "app/ReportCommand.h"
#include "app/Tsv.h"
#include "app/Workspace.h"
#include "host/UException.h"
#include "host/automate/Automate.h"
#include "host/automate/Registry.h"
#include "host/ui/TerminalDriver.h"

namespace quarvo::app {

using namespace host;

namespace {

struct Options {
  std::string db = "quarvo.db";
  std::string company = "DEMO";
  std::string user = "demo";
  std::vector<std::string> answers;
};

// The caller's side of a run: one text field per argument, passed by reference so the
// automaton's results come back into them.
struct CallerFields {
  std::vector<std::unique_ptr<Field>> fields;
  std::vector<Arg> args;

  explicit CallerFields(const std::vector<std::string>& values) {
    for (size_t i = 0; i < values.size(); ++i) {
      fields.push_back(std::make_unique<Field>("ARG" + std::to_string(i), "", "", 4, Kind::Chaine,
                                               Valeur::chaine(values[i]), nullptr));
      args.push_back(fields.back().get());
    }
  }
  void print(std::ostream& out) const {
    for (size_t i = 0; i < fields.size(); ++i) out << i << "=" << fields[i]->text() << "\n";
  }
};

void checkConversions(const Evt& evt, const std::vector<std::string>& values) {
  if (evt.refus().empty()) return;
  int i = evt.refus().front();
  throw UsageError("parameter " + std::to_string(i) + " ('" + values[static_cast<size_t>(i)] +
                   "') does not convert to the kind of the field it is bound to");
}

int printOutcome(std::ostream& out, int outcome) {
  out << "outcome: " << (outcome == 0 ? "ok" : "failed") << "\n";
  return outcome == 0 ? 0 : 1;
}

}  // namespace

int runCommandLine(int argc, char** argv, std::ostream& out, std::ostream& err) {
  CLI::App cli{"QUARVO: purchase pieces linked to project budgets"};
  cli.require_subcommand(1);
  Options o;
  cli.add_option("--db", o.db, "Database file")->capture_default_str();
  cli.add_option("--company", o.company, "Company code of the session")->capture_default_str();
  cli.add_option("--user", o.user, "User of the session")->capture_default_str();
  cli.add_option("--answer", o.answers,
                 "Answer to the next dialog (button number or text); repeat in order. Dialogs "
                 "without an answer are refused");

  bool demoData = false;
  auto* init = cli.add_subcommand("init", "Create the schema (idempotent)");
  init->add_flag("--demo", demoData, "Seed the demo data set");

  std::string table;
  std::string file;
  auto* load = cli.add_subcommand("load", "Load rows of a table from a tab-separated file");
  load->add_option("TABLE", table, "Table name")->required();
  load->add_option("FILE", file, "Tab-separated file with a header of column names")->required();

  std::vector<std::string> where;
  auto* dump = cli.add_subcommand("dump", "Print the rows of a table, tab-separated");
  dump->add_option("TABLE", table, "Table name")->required();
  dump->add_option("--where", where, "COL=VALUE filter (repeatable)");

  auto* automata = cli.add_subcommand("automata", "List the registered automata");

  std::string name;
  std::string label;
  std::vector<std::string> params;
  auto* run = cli.add_subcommand("run", "Run a registered automaton with positional parameters");
  run->add_option("NAME", name, "Automaton name")->required();
  run->add_option("ARGS", params, "Positional parameters");

  auto* call = cli.add_subcommand("call", "Run a label of a module's interface automaton");
  call->add_option("MODULE", name, "Module name")->required();
  call->add_option("LABEL", label, "Procedure label")->required();
  call->add_option("ARGS", params, "Positional parameters");

  std::string pieceKind;
  std::string pieceIdent;
  auto* analyse = cli.add_subcommand(
      "analyse", "Check that a purchasing piece can be carried into the accounting link");
  auto* cancel = cli.add_subcommand("cancel", "Remove every link of one purchasing piece");
  for (auto* sub : {analyse, cancel}) {
    sub->add_option("KIND", pieceKind, "Piece kind: GAPECOM, GAPEBL, GAPEFAC or CF, BF, FF")
        ->required();
    sub->add_option("IDENT", pieceIdent, "Identifier or document number of the piece")->required();
  }

  std::string lineIdent;
  auto* recompute =
      cli.add_subcommand("recompute", "Recompute a budget line's figures from its links");
  recompute->add_option("LINE", lineIdent, "Budget line identifier")->required();

  std::optional<std::string> checkLine;
  bool fix = false;
  auto* check = cli.add_subcommand(
      "check",
      "Compare each budget line's committed and realised figures with its links (exit 1 when "
      "some differ)");
  check->add_option("--line", checkLine, "Only this budget line");
  check->add_flag("--fix", fix, "Bring the differing lines in line, in one transaction");

  ImputeOptions imputeOptions;
  auto* impute = cli.add_subcommand(
      "impute",
      "Impute purchasing pieces to budget lines: without options the automatic imputation, with "
      "options a pointing of that selection then the imputation");
  impute->add_option("--from", imputeOptions.from, "Lowest creation date (dd/mm/yyyy)");
  impute->add_option("--to", imputeOptions.to, "Highest creation date (dd/mm/yyyy)");
  impute->add_option("--kind", imputeOptions.kind, "T all, C orders, B receipts, F invoices");
  impute->add_option("--numbers", imputeOptions.numbers, "Document numbers MIN:MAX");
  impute->add_option("--project", imputeOptions.project, "Project code");
  impute->add_flag("--arbitration", imputeOptions.arbitration,
                   "First suitable budget line wins; a missing one is created");
  impute->add_flag("--dry-run", imputeOptions.dryRun, "Point only and print the proposal");

  ImportOptions importOptions;
  auto* import = addImportCommand(cli, importOptions);

  ReportOptions reportOptions;
  std::string pdfFile;
  std::string exportFile;
  bool noBefore = false;
  auto* report = cli.add_subcommand("report", "Print or export the purchase follow-up report");
  report->add_option("--from", reportOptions.from,
                     "First day (dd/mm/yyyy); default: the company's current month");
  report->add_option("--to", reportOptions.to, "Last day; default: end of that month");
  auto* projectOption =
      report->add_option("--project", reportOptions.project, "One project by code");
  report->add_option("--budget", reportOptions.budget, "One budget by identifier")
      ->excludes(projectOption);
  report->add_option("--criterion", reportOptions.criterion,
                     "Grouping: AFCLIE AFETAB AFSERV AFRPS1 AFRPS2 AFCRI1..5");
  report->add_option("--options", reportOptions.options,
                     "Five 0/1: page per project, lines, pieces, recap 1, recap 2 (11100)");
  report->add_option("--states", reportOptions.states,
                     "Budget states T|A|NC|NA|C, ':O' for closed budgets");
  report->add_flag("--no-before", noBefore, "Leave out pieces dated before the period");
  auto* printOption =
      report->add_option("--print", pdfFile, "PDF file (default: under the database folder)")
          ->expected(0, 1);
  auto* exportOption =
      report
          ->add_option("--export", exportFile,
                       "Export file; .xlsx gives a workbook (default: the saved one)")
          ->expected(0, 1);

  GenerateOptions genOptions;
  auto* gen = cli.add_subcommand(
      "gen", "Add a synthetic data set (on a demo database) for benchmarks and large tests");
  gen->add_option("--projects", genOptions.projects, "Projects, one budget each")
      ->capture_default_str();
  gen->add_option("--pieces", genOptions.pieces, "Supplier orders")->capture_default_str();
  gen->add_option("--lines", genOptions.lines, "Lines per order")->capture_default_str();
  gen->add_option("--services", genOptions.services, "Services, one budget line each per budget")
      ->capture_default_str();

  std::string demoDir = "quarvo-demo";
  auto* demo = cli.add_subcommand("demo", "Build a demo database and show what QUARVO does");
  demo->add_option("--dir", demoDir, "Folder to create afresh")->capture_default_str();

  for (auto* sub : {run, call}) sub->allow_extras(false);
  run->prefix_command(false);

  try {
    cli.parse(argc, argv);
  } catch (const CLI::ParseError& e) {
    if (e.get_exit_code() == 0) {
      out << cli.help();
      if (auto* s = cli.get_subcommands().empty() ? nullptr : cli.get_subcommands().front()) {
        (void)s;
      }
      return 0;
    }
    return cli.exit(e, out, err) == 0 ? 0 : 2;
  }

  try {
    std::deque<std::string> answers(o.answers.begin(), o.answers.end());
    TerminalDriver ui(err, answers, isatty(STDERR_FILENO) != 0);

    if (*demo) return runDemo(demoDir, out, err);

    if (*automata) {
      for (const auto& n : Registry::instance().names()) out << n << "\n";
      return 0;
    }

    std::unique_ptr<Workspace> ws = *init ? Workspace::init(o.db) : Workspace::open(o.db);
    Session& session = ws->startSession(ui, o.company, o.user);
    Session::Scope scope(session);

    if (*init) {
      bool seeded = demoData && ws->seedDemo();
      out << "database " << o.db << " ready" << (seeded ? " with the demo data" : "") << "\n";
      return 0;
    }
    if (*load) {
      std::ifstream in(file, std::ios::binary);
      if (!in) throw UsageError("cannot read " + file);
      size_t n = loadTsv(session, table, in, file);
      out << n << " rows loaded into " << table << "\n";
      return 0;
    }
    if (*dump) {
      std::vector<std::pair<std::string, std::string>> filters;
      for (const auto& w : where) {
        auto eq = w.find('=');
        if (eq == std::string::npos) throw UsageError("--where expects COL=VALUE, not '" + w + "'");
        filters.emplace_back(w.substr(0, eq), w.substr(eq + 1));
      }
      dumpTsv(session, table, filters, out);
      return 0;
    }
    if (*report) {
      reportOptions.beforePeriod = !noBefore;
      if (*printOption) reportOptions.print = pdfFile;
      if (*exportOption) reportOptions.exportFile = exportFile;
      return runReport(session, reportOptions, out);
    }
    if (*import) return runImport(session, importOptions, out);
    if (*gen) return runGenerate(session, genOptions, out);
    if (*impute) return runImpute(session, imputeOptions, out);
    if (*analyse) return runAnalyse(session, pieceKind, pieceIdent, out);
    if (*cancel) return runCancel(session, pieceKind, pieceIdent, out);
    if (*recompute) return runRecompute(session, lineIdent, out);
    if (*check) return runCheck(session, checkLine, fix, out);
    if (*run) {
      CallerFields caller(params);
      EvtParamRef evt(caller.args);
      AutomatePtr automate = session.creer(name, &evt);
      if (!automate) throw UsageError("unknown automaton " + name + " (see 'quarvo automata')");
      checkConversions(evt, params);
      automate->executer(&evt);
      session.executerEnAttente();
      caller.print(out);
      return printOutcome(out, automate->outcome());
    }
    if (*call) {
      if (!Registry::instance().find(name + "-INTERFACE")) {
        throw UsageError("unknown module " + name);
      }
      CallerFields caller(params);
      EvtParamRef evt(caller.args);
      int outcome = session.appelerProcedure(name, label, &evt);
      session.executerEnAttente();
      caller.print(out);
      return printOutcome(out, outcome);
    }
  } catch (const UsageError& e) {
    err << "quarvo: " << e.what() << "\n";
    return 2;
  } catch (const UException& e) {
    err << "quarvo: " << e.what() << "\n";
    return 2;
  } catch (const std::exception& e) {
    err << "quarvo: " << e.what() << "\n";
    return 2;
  }
  return 0;
}

}  // namespace quarvo::app
