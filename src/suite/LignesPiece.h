// The line modules of the purchasing pieces: "GAPLCOM" (order lines), "GAPLBL" (goods-received
// note lines), "GAPLFAC" (invoice lines). A line's "NUMERO" is its header's "IDENT" | rank; the
// header module owns the lines, this interface only reads them.
//
// Rule: the generic reads, and a walk over the lines of one piece. "POSDEBUT" (piece
// identifier) starts the walk at the piece's first line, in the table's key order ("IDENT"),
// replacing the module's walk in progress; it always succeeds. "LECTURE_SUIVANT" reads the
// walk's next line into the interface record "I_<table>"; it fails, leaving the record empty,
// after the last line and when no walk was started. The walk is kept in the session's memory
// table "M_PARCOURS_LIGNES" (one row per module: the piece and the last line read), so it
// survives from one call to the next.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class LignesPiece : public TableInterface {
 public:
  explicit LignesPiece(host::Evt* evt);

 private:
  void posDebut(host::Evt* evt);
  void lectureSuivant(host::Evt* evt);
  // Selects this module's walk on `etat`, a cursor on the walks' memory table.
  void duModule(host::Table& etat) const;
};

}  // namespace quarvo::suite
