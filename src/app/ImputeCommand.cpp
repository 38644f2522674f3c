#include "app/ImputeCommand.h"

#include <ostream>

#include "app/Console.h"
#include "app/PiloteEcran.h"
#include "app/ScreenCommand.h"
#include "app/Workspace.h"
#include "host/UException.h"
#include "host/automate/Automate.h"
#include "host/table/Database.h"
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

// The document number range of --numbers MIN:MAX (either side may be empty).
std::pair<std::string, std::string> bornesNumeros(const ImputeOptions& o) {
  if (!o.numbers) return {};
  auto colon = o.numbers->find(':');
  if (colon == std::string::npos) throw UsageError("--numbers expects MIN:MAX");
  return {o.numbers->substr(0, colon), o.numbers->substr(colon + 1)};
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

// What this run did, from the records the writer leaves on each pointed piece.
struct Bilan {
  int64_t pointees = 0;
  int64_t imputables = 0;
  int64_t ecrites = 0;
  int64_t dejaLiees = 0;
  int64_t nonEcrites = 0;  // imputable, and not written: the database refused it
  int64_t liens = 0;
  Monnaie montant;
};

Bilan bilan() {
  Bilan b;
  Table pieces(nullptr, "VOVOVA", "M_EAPPR", "RESUME");
  pieces.ouvrir();
  while (pieces.lire(1) == 0) {
    ++b.pointees;
    if (pieces.valeur("IMPUTATION").toChaine() == "O") ++b.imputables;
    std::string ecriture = pieces.valeur("ECRITURE").toChaine();
    if (ecriture == "ECRITE") ++b.ecrites;
    if (ecriture == "DEJA_LIEE") ++b.dejaLiees;
    if (ecriture.empty() && pieces.valeur("IMPUTATION").toChaine() == "O") ++b.nonEcrites;
    b.liens += toEntier(pieces.valeur("LIENS_CREES"));
    b.montant += toMonnaie(pieces.valeur("HT_LIE"));
  }
  return b;
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

int imputer(Session& s, const ImputeOptions& o, std::ostream& out) {
  Session::Scope scope(s);
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
    auto [min, max] = bornesNumeros(o);
    for (const char* work : {"M_EAPPR", "M_LAPPR", "M_VAPPR"}) s.memoire(work).clear();
    EvtParamVal selection{val(dateOption(o.from, "from")),
                          val(o.to ? dateOption(o.to, "to") : finDuMoisCourant(s)),
                          val(kind),
                          val(o.arbitration ? 1 : 0),
                          val(min),
                          val(max),
                          val(o.project.value_or(""))};
    if (o.dryRun) {
      // The pointing may create a missing budget line under arbitration: a dry run keeps none
      // of it.
      Transaction apercu(s.db());
      s.appelerModule("QUARVO-POINTER_PIECES", &selection);
      printProposal(out);
    } else {
      s.appelerModule("QUARVO-POINTER_PIECES", &selection);
      s.appelerModule("QUARVO-IMPUTER_PIECES", nullptr);
    }
  }
  Bilan b = bilan();
  out << "Pieces pointed: " << b.pointees << "; " << (o.dryRun ? "imputable: " : "imputed: ")
      << (o.dryRun ? b.imputables : b.ecrites) << "; in error: " << b.pointees - b.imputables
      << "; link rows written: " << b.liens << " new";
  if (!o.dryRun) out << " (linked amount " << b.montant.text() << ")";
  out << "\n";
  if (b.dejaLiees > 0) {
    out << b.dejaLiees
        << " piece(s) left as they were: linked by another job since they were pointed\n";
  }
  return 0;
}

}  // namespace

int runImputeReview(Session& s, const ImputeOptions& o, std::istream& in, std::ostream& out,
                    std::ostream& err) {
  if (o.arbitration || o.dryRun) {
    throw UsageError(
        "--review shows the proposal on the screen: not with --arbitration or "
        "--dry-run");
  }
  std::string kind = o.kind.value_or("T");
  if (kind != "T" && kind != "C" && kind != "B" && kind != "F") {
    throw UsageError("--kind must be T, C, B or F, not '" + kind + "'");
  }
  if (o.to && o.to->empty()) throw UsageError("--to may not be empty: the period needs its end");
  auto [min, max] = bornesNumeros(o);
  std::string from = dateOption(o.from, "from");
  std::string to = o.to ? dateOption(o.to, "to") : "";
  std::vector<LigneScript> script;
  if (o.script) script = lireScript(*o.script, in);

  UiDriver& terminal = s.ui();
  ModeleEcran model(s, &terminal, true);
  if (model.ouvrir("QUARVO-IMPUTER") != ModeleEcran::Ouverture::Ouverte) {
    throw UsageError("the imputation selection QUARVO-IMPUTER could not be opened");
  }
  PiloteEcran screen(model, terminal);
  auto poser = [&](const std::string& field, const std::string& value) {
    if (!screen.saisir(field, value)) {
      throw UsageError("the imputation selection refuses " + field + " = '" + value +
                       "': " + screen.refus());
    }
  };
  if (o.from) poser("VDATEMIN", from);
  if (o.to) poser("VDATEMAX", to);
  poser("VTYPE_PIECE", kind);
  poser("VNUMMIN", min);
  poser("VNUMMAX", max);
  if (o.project) {
    poser("VAFFA_TOUTES", "U");
    poser("VAFFA_CODE", *o.project);
  }
  Action avancer;
  avancer.genre = Action::Genre::Presser;
  avancer.cible = "AVANCER";
  if (!model.agir(avancer)) {
    out << "the imputation selection refused the proposal: " << screen.refus() << "\n";
    return 1;
  }
  if (!o.script) {
    Action oui;
    oui.genre = Action::Genre::Repondre;
    oui.valeur = "1";
    if (model.etat().dialogue && !model.agir(oui)) {
      out << "the pointing was refused: " << screen.refus() << "\n";
      return 1;
    }
    printProposal(out);
    Bilan b = bilan();
    out << "Pieces pointed: " << b.pointees << "; imputable: " << b.imputables
        << "; in error: " << b.pointees - b.imputables << " (nothing written)\n";
    return 0;
  }
  // The screen empties its work tables when it closes: what was written is read in the links.
  auto liens = [] {
    std::pair<int64_t, Monnaie> total{0, Monnaie()};
    Table t(nullptr, "VOVOVA", "QUARVO", "REVUE");
    t.ouvrir();
    while (t.lire(1) == 0) {
      ++total.first;
      total.second += toMonnaie(t.valeur("HT"));
    }
    return total;
  };
  auto avant = liens();
  int rc = jouerScript(model, script, false, out, err);
  model.fermerTout();
  auto apres = liens();
  out << "Link rows written: " << apres.first - avant.first << " new (linked amount "
      << (apres.second - avant.second).text() << ")\n";
  return rc;
}

int runImpute(Session& s, const ImputeOptions& o, std::ostream& out) {
  try {
    return imputer(s, o, out);
  } catch (const BaseIndisponible&) {
    out << "Pieces not written: " << bilan().nonEcrites << "\n";
    throw;
  }
}

}  // namespace quarvo::app
