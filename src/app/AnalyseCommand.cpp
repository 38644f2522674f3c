#include "app/AnalyseCommand.h"

#include <ostream>
#include <vector>

#include "app/Console.h"
#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/table/Table.h"

namespace quarvo::app {

using namespace host;

int runAnalyse(Session& session, const std::string& kind, const std::string& ident,
               std::ostream& out) {
  Session::Scope scope(session);
  PieceArg piece = findPiece(kind, ident);
  const std::string& table = piece.table;
  const std::string& pieceIdent = piece.ident;
  const std::string& numero = piece.numero;

  // Rows already in the error table (import errors, earlier analyses) are not this run's.
  Table errors(nullptr, "VOVOVA", "IMM_ERREUR", "ANALYSE");
  std::string lastBefore;
  if (errors.lire(4) == 0) lastBefore = errors.valeur("IDENT").toChaine();

  Field erreur("P_ERREUR", "", "", 4, Kind::Chaine, Valeur::chaine("0"), nullptr);
  EvtParamRef evt{val(table), val(pieceIdent), val(1), val(""), ref(erreur)};
  if (session.appelerModule("QUARVO-ANALYSER", &evt) != 0) {
    throw UsageError("the accounting analysis of " + table + " " + pieceIdent +
                     " could not run to its end");
  }

  std::vector<TextRow> added;
  bool journal = false;
  errors.effacerCriteres();
  if (!lastBefore.empty()) errors.ajouterCritere("IDENT", '+', Valeur::chaine(lastBefore));
  while (errors.lire(1) == 0) {
    TextRow row;
    for (const char* column : {"IDENT", "COMPOSANT", "CODE", "DESIG", "CMT"}) {
      row.push_back(errors.valeur(column).toChaine());
    }
    if (row[0] == lastBefore) continue;
    journal = journal || (row[1] == "GCPCOMPT" && row[2] == "JL_ACHAT");
    added.push_back(std::move(row));
  }

  out << "Accounting analysis of " << table << " " << pieceIdent << " (" << numero << ")\n";
  bool failed = erreur.text() == "1" || journal;
  if (!added.empty())
    printTable(out, {"Number", "Component", "Code", "Designation", "Comment"}, added);
  if (!failed) {
    out << "No error: the piece can be carried into the accounting.\n";
    return 0;
  }
  out << added.size() << (added.size() == 1 ? " error" : " errors")
      << ": the piece cannot be carried into the accounting yet.\n";
  return 1;
}

}  // namespace quarvo::app
