#include "app/ReportCommand.h"

#include <ostream>
#include <sstream>

#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/automate/Edition_etat.h"
#include "host/automate/Seletat.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;
namespace fs = std::filesystem;

namespace {

void poser(Automate& w, const std::string& field, const std::string& value) {
  Field* f = w.champ(field);
  if (f == nullptr || !f->assign(Valeur::chaine(value))) {
    throw UsageError("the report screen refuses " + field + " = '" + value + "'");
  }
}

std::string date(const std::string& option, const std::string& text) {
  auto d = Date::parse(text);
  if (!d || d->empty()) throw UsageError(option + " expects a date dd/mm/yyyy, not '" + text + "'");
  return d->text();
}

// Presses the screen's OK button and lets the work it launched run. Returns its refusal flag.
int valider(Session& session, Automate& w) {
  EvtParamVal e;
  w.raise("VALID", &e);
  session.executerEnAttente();
  return e.erreur();
}

bool ecrit(const fs::path& file) {
  std::error_code ec;
  return fs::exists(file, ec) && fs::file_size(file, ec) > 0;
}

}  // namespace

int runReport(Session& session, const ReportOptions& o, std::ostream& out, ReportPaths* paths) {
  Session::Scope scope(session);
  if (!o.options.empty() &&
      (o.options.size() != 5 || o.options.find_first_not_of("01") != std::string::npos)) {
    throw UsageError(
        "--options expects five 0/1 characters (page per project, lines, pieces, "
        "recapitulation 1, recapitulation 2), not '" +
        o.options + "'");
  }
  bool criterionKnown = false;
  for (const auto& [code, label] : Seletat::criteres()) criterionKnown |= code == o.criterion;
  if (!criterionKnown) throw UsageError("unknown --criterion '" + o.criterion + "'");
  if (!o.project.empty() && !o.budget.empty()) {
    throw UsageError("give --project or --budget, not both");
  }
  std::string state = o.states;
  std::string closed;
  if (auto colon = state.find(':'); colon != std::string::npos) {
    closed = state.substr(colon + 1);
    state = state.substr(0, colon);
  }
  if (!state.empty() && state != "T" && state != "A" && state != "NC" && state != "NA" &&
      state != "C") {
    throw UsageError("--states expects T, A, NC, NA or C (with :O for closed budgets), not '" +
                     o.states + "'");
  }
  std::string budgetProject;
  if (!o.budget.empty()) {
    Table budget(nullptr, "VOVOVA", "AFEBUD", "REPORT");
    if (budget.chercher(3, "IDENT", '=', Valeur::chaine(o.budget)) != 0) {
      throw UsageError("unknown budget " + o.budget);
    }
    budgetProject = budget.valeur("AFAFFA_CODE").toChaine();
  }

  session.appelerModule("QUARVO-SELETAT1", nullptr);
  Automate* window = session.fenetre("QUARVO-SELETAT1");
  if (window == nullptr) throw UsageError("the report screen QUARVO-SELETAT1 is not available");
  Automate& w = *window;
  if (!o.from.empty()) poser(w, "VDATEMIN", date("--from", o.from));
  if (!o.to.empty()) poser(w, "VDATEMAX", date("--to", o.to));
  if (!o.project.empty()) {
    poser(w, "VAFFA_CHOIX", "A");
    poser(w, "VAFFA_CODE", o.project);
  }
  if (!o.budget.empty()) {
    poser(w, "VAFFA_CHOIX", "B");
    poser(w, "VAFFA_CODE", budgetProject);
    poser(w, "VAFEBUD_IDENT", o.budget);
  }
  poser(w, "VCLASSEMENT", o.criterion);
  {
    EvtParamVal e;
    w.raise("VCLASSEMENT_LIB_FERME", &e);
  }
  if (!o.options.empty()) {
    const char* names[] = {"VFOLIO", "VCORPS", "VCORPS2", "VRECAP1", "VRECAP2"};
    for (size_t i = 0; i < 5; ++i) poser(w, names[i], std::string(1, o.options[i]));
  }
  if (!state.empty()) {
    poser(w, "VETAT", state);
    poser(w, state == "C" ? "VCLOS2" : "VCLOS", closed == "O" ? "O" : "N");
  }
  poser(w, "VPERIO_ANT", o.beforePeriod ? "1" : "0");

  ReportPaths done;
  int rc = 0;
  if (o.exportFile) {
    if (!o.exportFile->empty()) poser(w, "VFICHIER", *o.exportFile);
    fs::path file = w.champ("VFICHIER")->text();
    std::error_code ec;
    fs::remove(file, ec);
    poser(w, "VSORTIE", "0");
    if (valider(session, w) != 0 || !ecrit(file)) {
      rc = 1;
    } else {
      done.exported = file;
      out << "report exported to " << file.string() << "\n";
    }
  }
  if (rc == 0 && (o.print || !o.exportFile)) {
    fs::path pdf = o.print && !o.print->empty() ? fs::path(*o.print)
                                                : Edition_etat::destination(session, "IMPETAT1");
    Edition_etat::Destination destination(session, pdf);
    std::error_code ec;
    fs::remove(pdf, ec);
    poser(w, "VSORTIE", "1");
    if (valider(session, w) != 0 || !ecrit(pdf)) {
      rc = 1;
    } else {
      done.pdf = pdf;
      out << "report printed to " << pdf.string() << "\n";
    }
  }
  w.sortir();
  session.fenetresOuvertes();
  if (paths != nullptr) *paths = done;
  return rc;
}

ReportPaths reportDemo(Session& session, const fs::path& dir) {
  Session::Scope scope(session);
  ReportOptions o;
  std::string year = "2026";
  Table company(nullptr, "VOVOVA", "AFSOCI", "REPORT");
  if (company.chercher(3, "CODE", '=', Valeur::chaine(session.societe())) == 0) {
    std::string mois = company.valeur("MOIS_ANNEE").toChaine();
    if (mois.size() == 6) year = mois.substr(2);
  }
  o.from = "01/01/" + year;
  o.to = "31/12/" + year;
  o.criterion = "AFCLIE";
  o.options = "11111";
  o.print = (dir / "suivi_achats.pdf").string();
  o.exportFile = (dir / "suivi_achats.xlsx").string();
  std::ostringstream quiet;
  ReportPaths paths;
  runReport(session, o, quiet, &paths);
  return paths;
}

}  // namespace quarvo::app
