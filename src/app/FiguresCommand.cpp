#include "app/FiguresCommand.h"

#include <fmt/format.h>

#include <cmath>
#include <map>
#include <ostream>
#include <vector>

#include "app/Console.h"
#include "app/Workspace.h"
#include "host/UException.h"
#include "host/automate/Automate.h"
#include "host/table/Champ.h"
#include "host/table/Database.h"
#include "quarvo/frame/Apports.h"
#include "quarvo/frame/PieceKinds.h"

namespace quarvo::app {

using namespace host;

namespace {

// Committed and realised figures of one budget line.
struct Figures {
  Monnaie veng;
  Monnaie vrea[3];
  bool operator==(const Figures&) const = default;
};

Figures read(const std::string& line) {
  Table t(nullptr, "VOVOVA", "AFLBUD", "FIGURES");
  if (t.chercher(3, "IDENT", '=', Valeur::chaine(line)) != 0) {
    throw UsageError("no budget line has the identifier '" + line + "'");
  }
  Champ vrea("VREA", t);
  return {toMonnaie(t.valeur("VENG")), {vrea.at(0), vrea.at(1), vrea.at(2)}};
}

int interfaceCall(Session& s, const std::string& label, const std::string& line) {
  EvtParamVal evt{val(line)};
  return s.appelerProcedure("QUARVO", label, &evt);
}

// What the line holds that its links do not explain.
Figures drift(Session& s, const std::string& line) {
  Transaction probe(s.db());  // rolled back: the audit changes nothing
  if (interfaceCall(s, "SUPPRESSION_MAJ", line) != 0) {
    throw UsageError("budget line '" + line + "' could not be read");
  }
  return read(line);
}

bool isZero(const Figures& f) {
  return f.veng.isZero() && f.vrea[0].isZero() && f.vrea[1].isZero() && f.vrea[2].isZero();
}

// Withdraws the links, clears what remains, adds the links back.
void recompute(Session& s, const std::string& line) {
  Transaction tx(s.db());
  if (interfaceCall(s, "SUPPRESSION_MAJ", line) != 0) {
    throw UsageError("budget line '" + line + "' could not be read");
  }
  Table t(nullptr, "VOVOVA", "AFLBUD", "FIGURES");
  t.chercher(3, "IDENT", '=', Valeur::chaine(line));
  t.ecrire("VENG", Valeur::monnaie(Monnaie()));
  t.ecrire("VREA", Valeur::chaine("0.00;0.00;0.00"));
  t.modifier();
  if (interfaceCall(s, "VALIDATION_MAJ", line) != 0) {
    throw UsageError("budget line '" + line + "' could not be recomputed");
  }
  tx.commit();
}

const char* kFigureNames[] = {"VENG", "VREA[0]", "VREA[1]", "VREA[2]"};

Monnaie figure(const Figures& f, size_t i) {
  return i == 0 ? f.veng : f.vrea[i - 1];
}

std::vector<std::string> lines(const std::optional<std::string>& only) {
  if (only) return {*only};
  std::vector<std::string> all;
  Table t(nullptr, "VOVOVA", "AFLBUD", "FIGURES");
  t.ouvrir();
  while (t.lire(1) == 0) all.push_back(t.valeur("IDENT").toChaine());
  return all;
}

// The link rows of one piece, added up, against the piece itself.
struct PieceLiee {
  std::string table;
  std::string ident;
  std::string numero;
  double qte = 0;
  Monnaie ht;
};

// What the piece holds.
struct Contenu {
  bool borne = false;  // purchasing pieces only: a time entry's lines are no purchase lines
  double qte = 0;
  Monnaie ht;
};

// What the piece's lines hold: quantities and net amounts, by absolute value, whatever was
// settled since. nullopt when the piece does not exist.
std::optional<Contenu> contenuPiece(const std::string& table, const std::string& ident) {
  const frame::PieceKind* kind = frame::kindOfTable(table);
  if (kind == nullptr) return std::nullopt;
  Table entete(nullptr, kind->code.empty() ? "VOVOVA" : "GESCOM", table, "AUDIT_PIECE");
  if (entete.chercher(3, "IDENT", '=', Valeur::chaine(ident)) != 0) return std::nullopt;
  Contenu c;
  if (kind->code.empty()) return c;
  c.borne = true;
  auto colonneEntete = [&entete](const std::string& col) { return entete.valeur(col); };
  frame::EnteteAchat e = frame::enteteAchat(table, colonneEntete);
  Table lignes(nullptr, "GESCOM", std::string(kind->lines), "AUDIT_LIGNES");
  lignes.chercher(3, "NUMERO", '/', Valeur::chaine(ident + "|"));
  lignes.ouvrir();
  auto colonneLigne = [&lignes](const std::string& col) { return lignes.valeur(col); };
  while (lignes.lire(1) == 0) {
    frame::LigneAchat l = frame::ligneAchat(colonneLigne);
    l.qteSoldee = 0;
    frame::ApportLigne a = frame::apportLigne(e, l);
    c.qte += std::abs(a.qte);
    c.ht += a.ht.abs();
  }
  return c;
}

// Link rows that name no piece, and pieces linked beyond what they hold.
std::vector<TextRow> liensSansPiece() {
  std::map<std::pair<std::string, std::string>, PieceLiee> pieces;
  Table liens(nullptr, "VOVOVA", "QUARVO", "AUDIT_LIENS");
  liens.ouvrir();
  while (liens.lire(1) == 0) {
    std::string table = liens.valeur("COMPOSANT").toChaine();
    std::string ident = liens.valeur("COMPOSANT_IDENT").toChaine();
    PieceLiee& p = pieces[{table, ident}];
    p.table = table;
    p.ident = ident;
    p.numero = liens.valeur("PIECE").toChaine();
    p.qte += std::abs(toDouble(liens.valeur("QTE")));
    p.ht += toMonnaie(liens.valeur("HT")).abs();
  }
  std::vector<TextRow> rows;
  for (const auto& [key, p] : pieces) {
    auto contenu = contenuPiece(p.table, p.ident);
    std::string piece = p.table + " " + p.ident + " (" + p.numero + ")";
    if (!contenu) {
      rows.push_back({piece, "linked, but the piece does not exist", "", ""});
      continue;
    }
    if (!contenu->borne) continue;
    if (p.qte > contenu->qte + 1e-9) {
      rows.push_back({piece, "quantity linked beyond the piece's", fmt::format("{}", p.qte),
                      fmt::format("{}", contenu->qte)});
    }
    if (p.ht > contenu->ht) {
      rows.push_back({piece, "amount linked beyond the piece's", p.ht.text(), contenu->ht.text()});
    }
  }
  return rows;
}

// A budget line's number is its budget's identifier, '|', its place in the budget: the database
// derives the line's budget from the number when the number is written. A line whose budget
// disagrees with its number was changed behind the module's back (its budget column written
// alone): its figures would be reported under the wrong budget.
struct BudgetEcarte {
  std::string ligne;
  std::string numero;
  std::string budget;
  std::string parNumero;
};

std::vector<BudgetEcarte> budgetsEcartes(const std::optional<std::string>& only) {
  std::vector<BudgetEcarte> out;
  Table t(nullptr, "VOVOVA", "AFLBUD", "BUDGET_PAR_NUMERO");
  if (only) {
    t.chercher(3, "IDENT", '=', Valeur::chaine(*only));
  }
  t.ouvrir();
  while (t.lire(1) == 0) {
    std::string numero = t.valeur("NUMERO").toChaine();
    size_t barre = numero.find('|');
    if (barre == std::string::npos || barre == 0) continue;
    std::string budget = t.valeur("AFEBUD_IDENT").toChaine();
    if (budget == numero.substr(0, barre)) continue;
    out.push_back({t.valeur("IDENT").toChaine(), numero, budget, numero.substr(0, barre)});
  }
  return out;
}

// Gives each line its budget by its number, as the database does when a number is written.
void reparerBudgets(const std::vector<BudgetEcarte>& lignes) {
  Table t(nullptr, "VOVOVA", "AFLBUD", "BUDGET_PAR_NUMERO");
  for (const auto& l : lignes) {
    if (t.chercher(3, "IDENT", '=', Valeur::chaine(l.ligne)) != 0) continue;
    t.ecrire("AFEBUD_IDENT", Valeur::chaine(l.parNumero));
    if (t.modifier() != 0) throw UException("budget line " + l.ligne + " could not be written");
  }
}

}  // namespace

int runCheck(Session& s, const std::optional<std::string>& only, bool fix, std::ostream& out) {
  Session::Scope scope(s);
  std::vector<TextRow> rows;
  std::vector<std::string> drifting;
  for (const auto& line : lines(only)) {
    Figures stored = read(line);
    Figures extra = drift(s, line);
    if (isZero(extra)) continue;
    drifting.push_back(line);
    for (size_t i = 0; i < 4; ++i) {
      if (figure(extra, i).isZero()) continue;
      rows.push_back({line, kFigureNames[i], figure(stored, i).text(),
                      (figure(stored, i) - figure(extra, i)).text(), figure(extra, i).text()});
    }
  }
  // The links against their pieces, for the whole database (a link may be wrong on any line).
  std::vector<TextRow> pieces = only ? std::vector<TextRow>{} : liensSansPiece();
  std::vector<BudgetEcarte> ecartes = budgetsEcartes(only);
  if (drifting.empty() && pieces.empty() && ecartes.empty()) {
    out << "Every budget line checked matches its links.\n";
    return 0;
  }
  if (!ecartes.empty()) {
    std::vector<TextRow> lignes;
    for (const auto& e : ecartes) lignes.push_back({e.ligne, e.numero, e.budget, e.parNumero});
    out << ecartes.size() << " budget line(s) name another budget than their number:\n";
    printTable(out, {"Line", "Number", "Budget", "Budget by number"}, lignes);
    if (fix) {
      Transaction tx(s.db());
      reparerBudgets(ecartes);
      tx.commit();
      out << "Fixed: each now names the budget of its number.\n";
    }
  }
  if (!drifting.empty()) {
    out << drifting.size() << " budget line(s) differ from their links:\n";
    printTable(out, {"Line", "Figure", "Stored", "Recomputed", "Difference"}, rows);
  }
  if (fix && !drifting.empty()) {
    // One transaction for the whole fix: either every line is brought in line or none.
    Transaction tx(s.db());
    for (const auto& line : drifting) recompute(s, line);
    tx.commit();
    out << "Fixed: ";
    for (size_t i = 0; i < drifting.size(); ++i) out << (i ? ", " : "") << drifting[i];
    out << " now match their links.\n";
  }
  if (!pieces.empty()) {
    out << "Links that do not match their pieces"
        << (fix ? " (left as they are: which link is "
                  "right is for a person to say)"
                : "")
        << ":\n";
    printTable(out, {"Piece", "Problem", "Linked", "Piece holds"}, pieces);
  }
  return 1;
}

int runRecompute(Session& s, const std::string& line, std::ostream& out) {
  Session::Scope scope(s);
  Figures before = read(line);
  recompute(s, line);
  Figures after = read(line);
  std::vector<TextRow> rows;
  for (size_t i = 0; i < 4; ++i) {
    rows.push_back({kFigureNames[i], figure(before, i).text(), figure(after, i).text()});
  }
  out << "Budget line " << line << " recomputed from its links:\n";
  printTable(out, {"Figure", "Before", "After"}, rows);
  return 0;
}

int runCancel(Session& s, const std::string& kind, const std::string& ident, std::ostream& out) {
  Session::Scope scope(s);
  PieceArg piece = findPiece(kind, ident);
  std::vector<std::pair<std::string, Figures>> touched;
  Table links(nullptr, "VOVOVA", "QUARVO", "ANNULATION");
  links.ajouterCritere("COMPOSANT", '=', Valeur::chaine(piece.table));
  links.ajouterCritere("COMPOSANT_IDENT", '=', Valeur::chaine(piece.ident));
  links.ouvrir();
  while (links.lire(1) == 0) {
    std::string line = links.valeur("AFLBUD_IDENT").toChaine();
    Table exists(nullptr, "VOVOVA", "AFLBUD", "EXISTE");
    Figures f =
        exists.chercher(3, "IDENT", '=', Valeur::chaine(line)) == 0 ? read(line) : Figures{};
    touched.emplace_back(line, f);
  }
  out << "Cancellation of " << piece.table << " " << piece.ident << " (" << piece.numero << ")\n";
  if (touched.empty()) {
    out << "The piece is linked to no budget line: nothing to cancel.\n";
    return 0;
  }
  EvtParamVal evt{val(piece.table), val(piece.ident)};
  if (s.appelerModule("QUARVO-ANNULER1", &evt) != 0) {
    out << "The cancellation did not take place (see the message above).\n";
    return 1;
  }
  std::vector<TextRow> rows;
  for (const auto& [line, before] : touched) {
    Table exists(nullptr, "VOVOVA", "AFLBUD", "EXISTE");
    if (exists.chercher(3, "IDENT", '=', Valeur::chaine(line)) != 0) {
      rows.push_back({line, "(budget line no longer exists)", "", "", ""});
      continue;
    }
    Figures after = read(line);
    rows.push_back(
        {line, before.veng.text(), after.veng.text(), before.vrea[0].text(), after.vrea[0].text()});
  }
  printTable(out, {"Budget line", "Committed before", "after", "Realised before", "after"}, rows);
  out << touched.size() << " link(s) removed.\n";
  return 0;
}

}  // namespace quarvo::app
