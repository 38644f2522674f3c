#include "app/Commands.h"

#include <unistd.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <deque>
#include <fstream>
#include <functional>
#include <iostream>
#include <memory>
#include <optional>

#include "app/AnalyseCommand.h"
#include "app/CancelCommand.h"
#include "app/Demo.h"
#include "app/FiguresCommand.h"
#include "app/GenerateCommand.h"
#include "app/ImportCommand.h"
#include "app/ImputeCommand.h"
#include "app/ReportCommand.h"
#include "app/ScreenCommand.h"
#include "app/Tsv.h"
#include "app/Workspace.h"
#include "host/UException.h"
#include "host/automate/Automate.h"
#include "host/automate/Registry.h"
#include "host/table/Table.h"
#include "host/ui/TerminalDriver.h"

namespace quarvo::app {

using namespace host;

namespace {

struct Options {
  std::string db = "quarvo.db";
  int wait = 30;  // seconds a command waits for another program's lock on the database
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

// What a subcommand has when it runs: the streams, the driver, and (unless it runs without a
// database) the workspace and its session, current.
struct Contexte {
  const Options& options;
  std::ostream& out;
  std::ostream& err;
  Workspace* workspace = nullptr;
  Session* session = nullptr;
};

// A subcommand: its options declared on the command line, and what it does once they are parsed.
struct Commande {
  enum class Base { Aucune, Ouverte, Creee };
  CLI::App* app = nullptr;
  Base base = Base::Ouverte;
  // Runs automata of the company: the company must exist. Setting a database up (schema, rows
  // loaded or dumped) needs none.
  bool societe = true;
  std::function<int(Contexte&)> executer;
};

Commande initCommand(CLI::App& cli) {
  auto demo = std::make_shared<bool>(false);
  auto* app = cli.add_subcommand("init", "Create the schema (idempotent)");
  app->add_flag("--demo", *demo, "Seed the demo data set");
  return {app, Commande::Base::Creee, false, [demo](Contexte& c) {
            bool seeded = *demo && c.workspace->seedDemo();
            c.out << "database " << c.options.db << " ready"
                  << (seeded ? " with the demo data" : "") << "\n";
            return 0;
          }};
}

Commande loadCommand(CLI::App& cli) {
  auto table = std::make_shared<std::string>();
  auto file = std::make_shared<std::string>();
  auto* app = cli.add_subcommand("load", "Load rows of a table from a tab-separated file");
  app->add_option("TABLE", *table, "Table name")->required();
  app->add_option("FILE", *file, "Tab-separated file with a header of column names")->required();
  return {app, Commande::Base::Ouverte, false, [table, file](Contexte& c) {
            std::ifstream in(*file, std::ios::binary);
            if (!in) throw UsageError("cannot read " + *file);
            size_t n = loadTsv(*c.session, *table, in, *file);
            c.out << n << " rows loaded into " << *table << "\n";
            return 0;
          }};
}

Commande dumpCommand(CLI::App& cli) {
  auto table = std::make_shared<std::string>();
  auto where = std::make_shared<std::vector<std::string>>();
  auto* app = cli.add_subcommand("dump", "Print the rows of a table, tab-separated");
  app->add_option("TABLE", *table, "Table name")->required();
  app->add_option("--where", *where, "COL=VALUE filter (repeatable)");
  return {app, Commande::Base::Ouverte, false, [table, where](Contexte& c) {
            std::vector<std::pair<std::string, std::string>> filters;
            for (const auto& w : *where) {
              auto eq = w.find('=');
              if (eq == std::string::npos) {
                throw UsageError("--where expects COL=VALUE, not '" + w + "'");
              }
              filters.emplace_back(w.substr(0, eq), w.substr(eq + 1));
            }
            dumpTsv(*c.session, *table, filters, c.out);
            return 0;
          }};
}

Commande automataCommand(CLI::App& cli) {
  auto* app = cli.add_subcommand("automata", "List the registered automata");
  return {app, Commande::Base::Aucune, false, [](Contexte& c) {
            for (const auto& n : Registry::instance().names()) c.out << n << "\n";
            return 0;
          }};
}

// "run NAME ARGS" and "call MODULE LABEL ARGS": the caller's fields are printed afterwards.
Commande runCommand(CLI::App& cli) {
  auto name = std::make_shared<std::string>();
  auto params = std::make_shared<std::vector<std::string>>();
  auto* app = cli.add_subcommand("run", "Run a registered automaton with positional parameters");
  app->add_option("NAME", *name, "Automaton name")->required();
  app->add_option("ARGS", *params, "Positional parameters");
  app->allow_extras(false);
  app->prefix_command(false);
  return {app, Commande::Base::Ouverte, true, [name, params](Contexte& c) {
            CallerFields caller(*params);
            EvtParamRef evt(caller.args);
            AutomatePtr automate = c.session->creer(*name, &evt);
            if (!automate) {
              throw UsageError("unknown automaton " + *name + " (see 'quarvo automata')");
            }
            checkConversions(evt, *params);
            automate->executer(&evt);
            c.session->executerEnAttente();
            caller.print(c.out);
            return printOutcome(c.out, automate->outcome());
          }};
}

Commande callCommand(CLI::App& cli) {
  auto module = std::make_shared<std::string>();
  auto label = std::make_shared<std::string>();
  auto params = std::make_shared<std::vector<std::string>>();
  auto* app = cli.add_subcommand("call", "Run a label of a module's interface automaton");
  app->add_option("MODULE", *module, "Module name")->required();
  app->add_option("LABEL", *label, "Procedure label")->required();
  app->add_option("ARGS", *params, "Positional parameters");
  app->allow_extras(false);
  return {app, Commande::Base::Ouverte, true, [module, label, params](Contexte& c) {
            if (!Registry::instance().find(*module + "-INTERFACE")) {
              throw UsageError("unknown module " + *module);
            }
            CallerFields caller(*params);
            EvtParamRef evt(caller.args);
            int outcome = c.session->appelerProcedure(*module, *label, &evt);
            c.session->executerEnAttente();
            caller.print(c.out);
            return printOutcome(c.out, outcome);
          }};
}

// "analyse KIND IDENT" and "cancel KIND IDENT".
Commande pieceCommand(CLI::App& cli, const char* name, const char* description,
                      int (*action)(Session&, const std::string&, const std::string&,
                                    std::ostream&)) {
  auto kind = std::make_shared<std::string>();
  auto ident = std::make_shared<std::string>();
  auto* app = cli.add_subcommand(name, description);
  app->add_option("KIND", *kind, "Piece kind: GAPECOM, GAPEBL, GAPEFAC or CF, BF, FF")->required();
  app->add_option("IDENT", *ident, "Identifier or document number of the piece")->required();
  return {app, Commande::Base::Ouverte, true,
          [kind, ident, action](Contexte& c) { return action(*c.session, *kind, *ident, c.out); }};
}

// "cancel KIND IDENT" (one piece) or "cancel [--from D] ..." (the cancellation selection).
Commande cancelCommand(CLI::App& cli) {
  auto kind = std::make_shared<std::string>();
  auto ident = std::make_shared<std::string>();
  auto selection = std::make_shared<CancelSelection>();
  auto options = std::make_shared<std::vector<CLI::Option*>>();
  auto* app = cli.add_subcommand(
      "cancel",
      "Remove every link of one purchasing piece (KIND IDENT), or of the linked pieces of a "
      "selection (the cancellation selection screen)");
  app->add_option("KIND", *kind, "Piece kind: GAPECOM, GAPEBL, GAPEFAC or CF, BF, FF");
  app->add_option("IDENT", *ident, "Identifier or document number of the piece");
  options->push_back(app->add_option("--from", selection->from, "Lowest piece date"));
  options->push_back(
      app->add_option("--to", selection->to, "Highest piece date (default: end of month)"));
  options->push_back(app->add_option("--kind", selection->kind,
                                     "T all, C orders, B receipts, "
                                     "F invoices"));
  options->push_back(app->add_option("--numbers", selection->numbers, "Document numbers MIN:MAX"));
  options->push_back(app->add_option("--project", selection->project, "Project code"));
  options->push_back(
      app->add_option("--keep", selection->keep, "Piece number listed but kept (repeat)"));
  options->push_back(
      app->add_flag("--dry-run", selection->dryRun, "List the pieces and cancel nothing"));
  return {app, Commande::Base::Ouverte, true, [kind, ident, selection, options](Contexte& c) {
            bool flags = std::any_of(options->begin(), options->end(),
                                     [](const CLI::Option* o) { return o->count() > 0; });
            if (!kind->empty() || !ident->empty()) {
              if (flags) {
                throw UsageError(
                    "cancel KIND IDENT cancels one piece; the selection options "
                    "(--from, --to, --kind, ...) go without KIND IDENT");
              }
              if (ident->empty()) throw UsageError("cancel KIND IDENT: the piece is missing");
              return runCancel(*c.session, *kind, *ident, c.out);
            }
            return runCancelSelection(*c.session, *selection, c.out);
          }};
}

Commande recomputeCommand(CLI::App& cli) {
  auto line = std::make_shared<std::string>();
  auto* app = cli.add_subcommand("recompute", "Recompute a budget line's figures from its links");
  app->add_option("LINE", *line, "Budget line identifier")->required();
  return {app, Commande::Base::Ouverte, true,
          [line](Contexte& c) { return runRecompute(*c.session, *line, c.out); }};
}

Commande checkCommand(CLI::App& cli) {
  auto line = std::make_shared<std::optional<std::string>>();
  auto fix = std::make_shared<bool>(false);
  auto* app = cli.add_subcommand(
      "check",
      "Compare each budget line's committed and realised figures with its links (exit 1 when "
      "some differ)");
  app->add_option("--line", *line, "Only this budget line");
  app->add_flag("--fix", *fix, "Bring the differing lines in line, in one transaction");
  return {app, Commande::Base::Ouverte, true,
          [line, fix](Contexte& c) { return runCheck(*c.session, *line, *fix, c.out); }};
}

Commande imputeCommand(CLI::App& cli) {
  auto o = std::make_shared<ImputeOptions>();
  auto* app = cli.add_subcommand(
      "impute",
      "Impute purchasing pieces to budget lines: without options the automatic imputation, with "
      "options a pointing of that selection then the imputation");
  app->add_option("--from", o->from, "Lowest creation date (dd/mm/yyyy)");
  app->add_option("--to", o->to, "Highest creation date (dd/mm/yyyy)");
  app->add_option("--kind", o->kind, "T all, C orders, B receipts, F invoices");
  app->add_option("--numbers", o->numbers, "Document numbers MIN:MAX");
  app->add_option("--project", o->project, "Project code");
  app->add_flag("--arbitration", o->arbitration,
                "First suitable budget line wins; a missing one is created");
  app->add_flag("--dry-run", o->dryRun, "Point only and print the proposal");
  app->add_flag("--review", o->review,
                "The imputation selection screen advanced to its proposal, printed; with "
                "--script, actions played on it (open a piece, split it, validate)");
  app->add_option("--script", o->script, "With --review: file of screen actions ('-' stdin)");
  return {app, Commande::Base::Ouverte, true, [o](Contexte& c) {
            if (o->script && !o->review) throw UsageError("--script goes with --review");
            if (o->review) return runImputeReview(*c.session, *o, std::cin, c.out, c.err);
            return runImpute(*c.session, *o, c.out);
          }};
}

Commande importCommand(CLI::App& cli) {
  auto o = std::make_shared<ImportOptions>();
  auto* app = addImportCommand(cli, *o);
  return {app, Commande::Base::Ouverte, true,
          [o](Contexte& c) { return runImport(*c.session, *o, c.out); }};
}

Commande reportCommand(CLI::App& cli) {
  struct Saisie {
    ReportOptions options;
    std::string pdf;
    std::vector<std::string> exports;
    bool noBefore = false;
    CLI::Option* print = nullptr;
    CLI::Option* exporter = nullptr;
  };
  auto s = std::make_shared<Saisie>();
  auto* app = cli.add_subcommand("report", "Print or export the purchase follow-up report");
  app->add_option("--from", s->options.from,
                  "First day (dd/mm/yyyy); default: the company's current month");
  app->add_option("--to", s->options.to, "Last day; default: end of that month");
  auto* project = app->add_option("--project", s->options.project, "One project by code");
  app->add_option("--budget", s->options.budget, "One budget by identifier")->excludes(project);
  app->add_option("--criterion", s->options.criterion,
                  "Grouping: AFCLIE AFETAB AFSERV AFRPS1 AFRPS2 AFCRI1..5");
  app->add_option("--options", s->options.options,
                  "Five 0/1: page per project, lines, pieces, recap 1, recap 2 (11100)");
  app->add_option("--states", s->options.states,
                  "Budget states T|A|NC|NA|C, ':O' for closed budgets");
  app->add_flag("--no-before", s->noBefore, "Leave out pieces dated before the period");
  s->print = app->add_option("--print", s->pdf, "PDF file (default: under the database folder)")
                 ->expected(0, 1);
  s->exporter =
      app->add_option("--export", s->exports,
                      "Export file; .xlsx gives a workbook (default: the saved one); may be "
                      "repeated, one selection giving each file")
          ->expected(0, 1)
          ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll)
          ->default_str("");
  return {app, Commande::Base::Ouverte, true, [s](Contexte& c) {
            ReportOptions options = s->options;
            options.beforePeriod = !s->noBefore;
            if (*s->print) options.print = s->pdf;
            if (*s->exporter) {
              // "--export" without a file asks for the screen's saved one.
              options.exports = s->exports;
              if (options.exports.empty()) options.exports.push_back("");
            }
            return runReport(*c.session, options, c.out);
          }};
}

Commande screenCommand(CLI::App& cli) {
  auto o = std::make_shared<ScreenOptions>();
  auto* app = cli.add_subcommand(
      "screen", "Open a screen and play actions on it (a script, or at a prompt on a terminal)");
  app->add_option("NAME", o->name, "Screen automaton, e.g. QUARVO-SELETAT1")->required();
  app->add_option("ARGS", o->args, "Positional parameters of the screen");
  app->add_option("--script", o->script,
                  "File of actions, one per line ('-' the standard input): set FIELD VALUE, "
                  "cell LIST ROW COLUMN VALUE, select LIST ROW, tab NAME, press BUTTON, new "
                  "LIST, delete LIST ROW, answer N|TEXT|PATH, close");
  app->add_flag("--json", o->json, "Print each state as one JSON object per line");
  return {app, Commande::Base::Ouverte, true, [o](Contexte& c) {
            if (!c.options.answers.empty()) {
              throw UsageError("--answer does not apply to 'screen': answer in the script");
            }
            return runScreen(*c.session, *o, std::cin, isatty(STDIN_FILENO) != 0, c.out, c.err);
          }};
}

Commande linkCommand(CLI::App& cli) {
  auto o = std::make_shared<ScreenOptions>();
  auto line = std::make_shared<std::string>();
  auto modes = std::make_shared<std::string>("VMCA");
  auto* app = cli.add_subcommand(
      "link", "Open the link document of a budget line and play actions on it, as 'screen' does");
  app->add_option("LINE", *line, "Budget line identifier (AFLBUD IDENT)")->required();
  app->add_option("--mode", *modes,
                  "Functions allowed: V view, C new lines, M modify, A delete (narrowed by the "
                  "user's rights)")
      ->capture_default_str();
  app->add_option("--script", o->script, "File of actions, one per line ('-' the standard input)");
  app->add_flag("--json", o->json, "Print each state as one JSON object per line");
  return {app, Commande::Base::Ouverte, true, [o, line, modes](Contexte& c) {
            if (!c.options.answers.empty()) {
              throw UsageError("--answer does not apply to 'link': answer in the script");
            }
            return runLink(*c.session, *line, *modes, *o, std::cin, isatty(STDIN_FILENO) != 0,
                           c.out, c.err);
          }};
}

Commande genCommand(CLI::App& cli) {
  auto o = std::make_shared<GenerateOptions>();
  auto* app = cli.add_subcommand(
      "gen", "Add a synthetic data set (on a demo database) for benchmarks and large tests");
  app->add_option("--projects", o->projects, "Projects, one budget each")->capture_default_str();
  app->add_option("--pieces", o->pieces, "Supplier orders")->capture_default_str();
  app->add_option("--lines", o->lines, "Lines per order")->capture_default_str();
  app->add_option("--services", o->services, "Services, one budget line each per budget")
      ->capture_default_str();
  return {app, Commande::Base::Ouverte, true,
          [o](Contexte& c) { return runGenerate(*c.session, *o, c.out); }};
}

Commande demoCommand(CLI::App& cli) {
  auto dir = std::make_shared<std::string>("quarvo-demo");
  auto* app = cli.add_subcommand("demo", "Build a demo database and show what QUARVO does");
  app->add_option("--dir", *dir, "Folder to create afresh")->capture_default_str();
  return {app, Commande::Base::Aucune, false,
          [dir](Contexte& c) { return runDemo(*dir, c.out, c.err); }};
}

// Runs the parsed subcommand: opens (or creates) the database and the session it needs.
int executer(const Commande& commande, const Options& o, std::ostream& out, std::ostream& err) {
  std::deque<std::string> answers(o.answers.begin(), o.answers.end());
  TerminalDriver ui(err, answers, isatty(STDERR_FILENO) != 0);
  Contexte contexte{o, out, err};
  if (commande.base == Commande::Base::Aucune) return commande.executer(contexte);
  std::unique_ptr<Workspace> ws =
      commande.base == Commande::Base::Creee ? Workspace::init(o.db) : Workspace::open(o.db);
  ws->db().delaiAttente(std::chrono::seconds(o.wait));
  Session& session = ws->startSession(ui, o.company, o.user);
  Session::Scope scope(session);
  if (commande.societe) {
    Table societes(nullptr, "VOVOVA", "AFSOCI", "SOCIETE");
    if (societes.chercher(3, "CODE", '=', Valeur::chaine(o.company)) != 0) {
      throw UsageError("unknown company '" + o.company + "' (--company): no company of " + o.db +
                       " has that code");
    }
  }
  contexte.workspace = ws.get();
  contexte.session = &session;
  return commande.executer(contexte);
}

}  // namespace

int runCommandLine(int argc, char** argv, std::ostream& out, std::ostream& err) {
  CLI::App cli{"QUARVO: purchase pieces linked to project budgets"};
  cli.require_subcommand(1);
  Options o;
  cli.add_option("--db", o.db, "Database file")->capture_default_str();
  cli.add_option("--company", o.company, "Company code of the session")->capture_default_str();
  cli.add_option("--user", o.user, "User of the session")->capture_default_str();
  cli.add_option("--wait", o.wait,
                 "Seconds to wait for another program's lock on the database before giving up")
      ->capture_default_str()
      ->check(CLI::NonNegativeNumber);
  cli.add_option("--answer", o.answers,
                 "Answer to the next dialog: a button's number or its text; repeat in order. A "
                 "dialog without an answer, or whose answer names no button, is refused");

  const std::vector<Commande> commandes{
      initCommand(cli),
      loadCommand(cli),
      dumpCommand(cli),
      automataCommand(cli),
      runCommand(cli),
      callCommand(cli),
      pieceCommand(cli, "analyse",
                   "Check that a purchasing piece can be carried into the accounting link",
                   runAnalyse),
      cancelCommand(cli),
      recomputeCommand(cli),
      checkCommand(cli),
      imputeCommand(cli),
      importCommand(cli),
      reportCommand(cli),
      screenCommand(cli),
      linkCommand(cli),
      genCommand(cli),
      demoCommand(cli),
  };

  // A word where the command is expected that names no command is named back.
  for (int i = 1; i < argc; ++i) {
    std::string word = argv[i];
    if (word == "--db" || word == "--company" || word == "--user" || word == "--answer" ||
        word == "--wait") {
      ++i;
      continue;
    }
    if (word.rfind("-", 0) == 0) continue;
    auto all = cli.get_subcommands([](CLI::App*) { return true; });
    if (std::none_of(all.begin(), all.end(),
                     [&word](const CLI::App* sub) { return sub->get_name() == word; })) {
      err << "quarvo: unknown command '" << word << "' (see quarvo --help)\n";
      return 2;
    }
    break;
  }

  try {
    cli.parse(argc, argv);
  } catch (const CLI::ParseError& e) {
    if (e.get_exit_code() == 0) {
      out << cli.help();
      return 0;
    }
    return cli.exit(e, out, err) == 0 ? 0 : 2;
  }

  try {
    for (const auto& commande : commandes) {
      if (*commande.app) return executer(commande, o, out, err);
    }
  } catch (const std::exception& e) {
    // Usage errors, the runtime's own faults and the environment's all end the same way: one
    // line that says what and where.
    err << "quarvo: " << e.what() << "\n";
    return 2;
  }
  return 0;
}

}  // namespace quarvo::app
