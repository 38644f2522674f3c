#include "app/ImputeCommand.h"

#include <ostream>

#include "app/Console.h"
#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

namespace {

std::string dateOption(const std::optional<std::string>& text, const char* name) {
  if (!text) return "";
  auto d = Date::parse(*text);
  if (!d)
    throw UsageError(std::string("--") + name + " '" + *text + "' is not a date (dd/mm/yyyy)");
  return d->text();
}

// The last day of the company's current month: the default upper date, as on the screen.
std::string finDuMoisCourant(Session& s) {
  Table company(nullptr, "VOVOVA", "AFSOCI", "PERIODE");
  if (company.chercher(3, "CODE", '=', Valeur::chaine(s.societe())) != 0) {
    throw UsageError("company " + s.societe() + " does not exist");
  }
  std::string period = company.valeur("MOIS_ANNEE").toChaine();
  auto first = period.size() == 6
                   ? Date::parse("01/" + period.substr(0, 2) + "/" + period.substr(2))
                   : std::nullopt;
  return first ? first->lastOfMonth().text() : "";
}

int64_t linkRows() {
  Table links(nullptr, "VOVOVA", "QUARVO", "RESUME");
  return links.compter();
}

Monnaie linkTotal() {
  Table links(nullptr, "VOVOVA", "QUARVO", "RESUME");
  links.ouvrir();
  Monnaie total;
  while (links.lire(1) == 0) total += toMonnaie(links.valeur("HT"));
  return total;
}

void printProposal(std::ostream& out) {
  Table pieces(nullptr, "VOVOVA", "M_EAPPR", "PROPOSITION");
  Table lines(nullptr, "VOVOVA", "M_LAPPR", "PROPOSITION");
  Table allocations(nullptr, "VOVOVA", "M_VAPPR", "PROPOSITION");
  pieces.ouvrir();
  while (pieces.lire(1) == 0) {
    out << pieces.valeur("COMPOSANT").toChaine() << " " << pieces.valeur("PIECE").toChaine() << " ("
        << pieces.valeur("COMPOSANT_IDENT").toChaine() << ")  HT " << pieces.valeur("HT").toChaine()
        << (toEntier(pieces.valeur("ERREUR")) != 0 ? "  IN ERROR" : "") << "\n";
    lines.chercher(3, "NUMERO", '/', Valeur::chaine(pieces.valeur("IDENT").toChaine() + "|"));
    lines.ouvrir();
    while (lines.lire(1) == 0) {
      out << "  line " << lines.valeur("NUMERO").toChaine() << "  "
          << lines.valeur("GCPARTIC_CODE").toChaine() << "  qty " << lines.valeur("QTE").toChaine()
          << "  HT " << lines.valeur("HT").toChaine()
          << (toEntier(lines.valeur("ERREUR")) != 0 ? "  in error" : "") << "\n";
      allocations.chercher(3, "IDENT", '=',
                           Valeur::chaine(lines.valeur("COMPOSANT").toChaine() + "|" +
                                          lines.valeur("COMPOSANT_IDENT").toChaine()));
      allocations.ouvrir();
      bool any = false;
      while (allocations.lire(1) == 0) {
        out << "    -> budget line " << allocations.valeur("AFLBUD_IDENT").toChaine() << "  qty "
            << allocations.valeur("QTE").toChaine() << "  HT "
            << allocations.valeur("HT").toChaine() << "\n";
        any = true;
      }
      if (!any) out << "    -> no budget line found\n";
    }
  }
}

}  // namespace

int runImpute(Session& s, const ImputeOptions& o, std::ostream& out) {
  Session::Scope scope(s);
  int64_t linksBefore = linkRows();
  Monnaie totalBefore = linkTotal();
  if (!o.selection()) {
    if (s.appelerModule("QUARVO-IMPUTER_AUTO", nullptr) != 0) {
      throw UsageError("the automatic imputation could not start (is the company readable?)");
    }
    s.executerEnAttente();
  } else {
    std::string kind = o.kind.value_or("T");
    if (kind != "T" && kind != "C" && kind != "B" && kind != "F") {
      throw UsageError("--kind must be T, C, B or F, not '" + kind + "'");
    }
    std::string min, max;
    if (o.numbers) {
      auto colon = o.numbers->find(':');
      if (colon == std::string::npos) throw UsageError("--numbers expects MIN:MAX");
      min = o.numbers->substr(0, colon);
      max = o.numbers->substr(colon + 1);
    }
    for (const char* work : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) s.memoire(work).clear();
    EvtParamVal selection{val(dateOption(o.from, "from")),
                          val(o.to ? dateOption(o.to, "to") : finDuMoisCourant(s)),
                          val(kind),
                          val(o.arbitration ? 1 : 0),
                          val(min),
                          val(max),
                          val(o.project.value_or(""))};
    s.appelerModule("QUARVO-POINTER_PIECES", &selection);
    if (o.dryRun)
      printProposal(out);
    else
      s.appelerModule("QUARVO-IMPUTER_PIECES", nullptr);
  }
  Table pieces(nullptr, "VOVOVA", "M_EAPPR", "RESUME");
  int64_t pointed = pieces.compter();
  pieces.ajouterCritere("IMPUTATION", '=', Valeur::chaine("O"));
  int64_t imputable = pieces.compter();
  int64_t linksAfter = linkRows();
  out << "Pieces pointed: " << pointed << "; " << (o.dryRun ? "imputable: " : "imputed: ")
      << imputable << "; in error: " << pointed - imputable
      << "; link rows written: " << (o.dryRun ? 0 : linksAfter - linksBefore) << " new";
  if (!o.dryRun) out << " (linked amount " << (linkTotal() - totalBefore).text() << ")";
  out << "\n";
  return 0;
}

}  // namespace quarvo::app
