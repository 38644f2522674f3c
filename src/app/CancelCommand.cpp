#include "app/CancelCommand.h"

#include <optional>
#include <ostream>
#include <set>

#include "app/Console.h"
#include "app/PiloteEcran.h"
#include "app/Workspace.h"
#include "host/table/Champ.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo::app {

using namespace host;

namespace {

std::string date(const char* option, const std::string& text) {
  auto d = Date::parse(text);
  if (!d || d->empty()) {
    throw UsageError(std::string(option) + " expects a date dd/mm/yyyy, not '" + text + "'");
  }
  return d->text();
}

// A piece as the screen's list shows it: component table, number, date, amount, mark.
struct Ligne {
  std::string composant;
  std::string piece;
  std::string date;
  std::string ht;
  std::string marque;
};

std::vector<Ligne> listeAffichee(const ModeleEcran& model) {
  std::vector<Ligne> out;
  if (model.etat().fenetres.empty()) return out;
  for (const auto& l : model.etat().fenetres.back().listes) {
    if (l.nom != "LST") continue;
    for (const auto& row : l.lignes) {
      if (row.size() >= 5) out.push_back({row[0], row[1], row[2], row[3], row[4]});
    }
  }
  return out;
}

std::string code(const std::string& composant) {
  const frame::PieceKind* kind = frame::kindOfTable(composant);
  return kind != nullptr && !kind->code.empty() ? std::string(kind->code) : composant;
}

// The link rows of the pieces: the budget lines they name, and how many there are.
int64_t liens(const std::vector<Ligne>& pieces, std::set<std::string>* lignes) {
  int64_t n = 0;
  for (const auto& p : pieces) {
    Table t(nullptr, "VOVOVA", "QUARVO", "ANNULATION");
    t.ajouterCritere("COMPOSANT", '=', Valeur::chaine(p.composant));
    t.ajouterCritere("PIECE", '=', Valeur::chaine(p.piece));
    t.ouvrir();
    while (t.lire(1) == 0) {
      ++n;
      if (lignes != nullptr) lignes->insert(t.valeur("AFLBUD_IDENT").toChaine());
    }
  }
  return n;
}

// Committed and realised figures of a budget line; nothing when it no longer exists.
struct Figures {
  Monnaie engage;
  Monnaie realise;
};

std::optional<Figures> figures(const std::string& line) {
  Table t(nullptr, "VOVOVA", "AFLBUD", "ANNULATION");
  if (t.chercher(3, "IDENT", '=', Valeur::chaine(line)) != 0) return std::nullopt;
  Champ vrea("VREA", t);
  return Figures{toMonnaie(t.valeur("VENG")), vrea.at(0)};
}

// Presses `button` and says yes to the question it asks (the one the command is there to
// answer); any question after it goes to the terminal.
bool presserEtConfirmer(ModeleEcran& model, PiloteEcran& screen, const std::string& button) {
  Action press;
  press.genre = Action::Genre::Presser;
  press.cible = button;
  bool accepted = model.agir(press);
  if (model.etat().dialogue) {
    Action oui;
    oui.genre = Action::Genre::Repondre;
    oui.valeur = "1";
    accepted = screen.jouer(oui);
  }
  return accepted;
}

int refus(std::ostream& out, const std::string& what, const PiloteEcran& screen) {
  out << "The cancellation screen refused " << what << ": " << screen.refus() << "\n";
  return 1;
}

}  // namespace

int runCancelSelection(Session& session, const CancelSelection& s, std::ostream& out) {
  Session::Scope scope(session);
  if (s.kind != "T" && s.kind != "C" && s.kind != "B" && s.kind != "F") {
    throw UsageError("--kind must be T, C, B or F, not '" + s.kind + "'");
  }
  std::string min, max;
  if (!s.numbers.empty()) {
    auto colon = s.numbers.find(':');
    if (colon == std::string::npos) throw UsageError("--numbers expects MIN:MAX");
    min = s.numbers.substr(0, colon);
    max = s.numbers.substr(colon + 1);
  }
  std::string from = s.from.empty() ? std::string() : date("--from", s.from);
  std::string to = s.to.empty() ? std::string() : date("--to", s.to);
  if (!s.project.empty()) {
    Table project(nullptr, "VOVOVA", "AFAFFA", "ANNULATION");
    if (project.chercher(3, "CODE", '=', Valeur::chaine(s.project)) != 0) {
      throw UsageError("no project has the code '" + s.project + "'");
    }
  }

  UiDriver& terminal = session.ui();
  ModeleEcran model(session, &terminal, true);
  PiloteEcran screen(model, terminal);
  if (model.ouvrir("QUARVO-ANNULER") != ModeleEcran::Ouverture::Ouverte) {
    out << "The cancellation screen did not open: " << screen.refus() << "\n";
    return 1;
  }
  // In the screen's order; what is not given keeps the screen's default.
  std::string affaires = s.project.empty() ? "T" : "U";
  const std::pair<const char*, std::string> champs[] = {
      {"VDATEMIN", from}, {"VDATEMAX", to},           {"VTYPE_PIECE", s.kind},  {"VNUMMIN", min},
      {"VNUMMAX", max},   {"VAFFA_TOUTES", affaires}, {"VAFFA_CODE", s.project}};
  for (const auto& [field, value] : champs) {
    if (value.empty()) continue;
    if (!screen.saisir(field, value)) {
      return refus(out, std::string(field) + " = '" + value + "'", screen);
    }
  }
  if (!presserEtConfirmer(model, screen, "AVANCER")) return refus(out, "the selection", screen);

  std::vector<Ligne> listees = listeAffichee(model);
  if (listees.empty()) {
    out << "No linked piece in the selection: nothing to cancel.\n";
    model.fermerTout();
    return 0;
  }
  std::vector<TextRow> rows;
  for (const auto& p : listees) rows.push_back({code(p.composant), p.piece, p.date, p.ht});
  out << listees.size() << " linked piece(s) in the selection:\n";
  printTable(out, {"Kind", "Piece", "Date", "Amount"}, rows);

  for (const auto& numero : s.keep) {
    bool found = false;
    for (size_t i = 0; i < listees.size(); ++i) {
      if (listees[i].piece != numero) continue;
      found = true;
      Action cell;
      cell.genre = Action::Genre::Cellule;
      cell.cible = "LST";
      cell.ligne = i + 1;
      cell.colonne = "LST_C5";
      cell.valeur = "N";
      if (!screen.jouer(cell)) return refus(out, "keeping " + numero, screen);
    }
    if (!found) throw UsageError("--keep " + numero + ": the selection lists no such piece");
  }
  std::vector<Ligne> marquees;
  for (const auto& p : listeAffichee(model)) {
    if (p.marque == "O") marquees.push_back(p);
  }
  if (!s.keep.empty()) {
    out << "Kept:";
    for (const auto& numero : s.keep) out << " " << numero;
    out << "\n";
  }
  if (marquees.empty()) {
    out << "Every listed piece is kept: nothing to cancel.\n";
    model.fermerTout();
    return 0;
  }
  if (s.dryRun) {
    out << "Dry run: " << marquees.size() << " piece(s) would be cancelled; nothing was changed.\n";
    model.fermerTout();
    return 0;
  }

  std::set<std::string> lignes;
  int64_t avant = liens(marquees, &lignes);
  std::vector<std::pair<std::string, std::optional<Figures>>> touchees;
  for (const auto& line : lignes) touchees.emplace_back(line, figures(line));
  if (!presserEtConfirmer(model, screen, "VALID")) return refus(out, "the cancellation", screen);
  int64_t restants = 0;
  size_t annulees = 0;
  for (const auto& p : marquees) {
    int64_t n = liens({p}, nullptr);
    restants += n;
    if (n == 0) ++annulees;
  }

  std::vector<TextRow> corrigees;
  for (const auto& [line, before] : touchees) {
    auto after = figures(line);
    if (!before || !after) {
      corrigees.push_back({line, "(budget line no longer exists)", "", "", ""});
      continue;
    }
    corrigees.push_back({line, before->engage.text(), after->engage.text(), before->realise.text(),
                         after->realise.text()});
  }
  printTable(out, {"Budget line", "Committed before", "after", "Realised before", "after"},
             corrigees);
  out << annulees << " piece(s) cancelled, " << avant - restants << " link(s) removed.\n";
  model.fermerTout();
  if (restants != 0) {
    out << restants << " link(s) of those pieces remain (see the messages above).\n";
    return 1;
  }
  return 0;
}

}  // namespace quarvo::app
