#include "app/ReportCommand.h"

#include <ostream>
#include <sstream>

#include "app/PiloteEcran.h"
#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/automate/Edition_etat.h"
#include "host/automate/Seletat.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"

namespace quarvo::app {

using namespace host;
namespace fs = std::filesystem;

namespace {

std::string date(const std::string& option, const std::string& text) {
  auto d = Date::parse(text);
  if (!d || d->empty()) throw UsageError(option + " expects a date dd/mm/yyyy, not '" + text + "'");
  return d->text();
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

  UiDriver& terminal = session.ui();
  ModeleEcran model(session, &terminal, true);
  if (model.ouvrir("QUARVO-SELETAT1") != ModeleEcran::Ouverture::Ouverte) {
    throw UsageError("the report screen QUARVO-SELETAT1 could not be opened");
  }
  PiloteEcran screen(model, terminal);
  // Typed as a person types them: each field's handler runs (the criterion enables the
  // recapitulations, the print options follow their rules).
  auto poser = [&](const std::string& field, const std::string& value) {
    if (!screen.saisir(field, value)) {
      throw UsageError("the report screen refuses " + field + " = '" + value +
                       "': " + screen.refus());
    }
  };
  if (!o.from.empty()) poser("VDATEMIN", date("--from", o.from));
  if (!o.to.empty()) poser("VDATEMAX", date("--to", o.to));
  if (!o.project.empty()) {
    poser("VAFFA_CHOIX", "A");
    poser("VAFFA_CODE", o.project);
  }
  if (!o.budget.empty()) {
    poser("VAFFA_CHOIX", "B");
    poser("VAFFA_CODE", budgetProject);
    poser("VAFEBUD_IDENT", o.budget);
  }
  poser("VCLASSEMENT", o.criterion);
  if (!o.options.empty()) {
    const char* names[] = {"VFOLIO", "VCORPS", "VCORPS2", "VRECAP1", "VRECAP2"};
    for (size_t i = 0; i < 5; ++i) poser(names[i], std::string(1, o.options[i]));
  }
  if (!state.empty()) {
    poser("VETAT", state);
    poser(state == "C" ? "VCLOS2" : "VCLOS", closed == "O" ? "O" : "N");
  }
  poser("VPERIO_ANT", o.beforePeriod ? "1" : "0");

  ReportPaths done;
  int rc = 0;
  for (const auto& exportFile : o.exports) {
    if (rc != 0) break;
    if (!exportFile.empty()) poser("VFICHIER", exportFile);
    fs::path file = screen.valeur("VFICHIER");
    std::error_code ec;
    fs::remove(file, ec);
    poser("VSORTIE", "0");
    if (!screen.presser("VALID") || !ecrit(file)) {
      rc = 1;
    } else {
      if (done.exported.empty()) done.exported = file;
      out << "report exported to " << file.string() << "\n";
    }
  }
  if (rc == 0 && (o.print || o.exports.empty())) {
    fs::path pdf = o.print && !o.print->empty() ? fs::path(*o.print)
                                                : Edition_etat::destination(session, "IMPETAT1");
    Edition_etat::Destination destination(session, pdf);
    std::error_code ec;
    fs::remove(pdf, ec);
    poser("VSORTIE", "1");
    if (!screen.presser("VALID") || !ecrit(pdf)) {
      rc = 1;
    } else {
      done.pdf = pdf;
      out << "report printed to " << pdf.string() << "\n";
    }
  }
  model.fermerTout();
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
  o.exports = {(dir / "suivi_achats.xlsx").string()};
  std::ostringstream quiet;
  ReportPaths paths;
  runReport(session, o, quiet, &paths);
  return paths;
}

}  // namespace quarvo::app
