// "<MODULE>-GESTION" for "GAPECOM", "GAPEBL", "GAPEFAC" and "AFEFFO": a document's own window, as
// the project links open it to show the piece a link is on. One implementation; what the kinds
// show is in their table of differences (SortesPiece.h). The window only reads: the module owns
// the document.
//
// Rule: created with the document's identifier and the modes asked (text), it shows the
// document read-only, whatever the modes (its mode is "V"): on screen "PIECE" (purchasing
// pieces: number, designation, date, supplier code, validated, amount "HT" and the quantity not
// yet carried forward "QTNT") or "AFEFFO" (time entries: number, designation, date, resource
// code, validated, hours and amount added up from the lines), with the list "LST" of its lines
// in rank order. Button "FERMER" (or the close box) ends the window, with success. A document
// that does not exist is said in a message, and the window ends while opening, failed.
#pragma once

#include <vector>

#include "host/automate/Fenetre_simple.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

class VuePiece : public host::Fenetre_simple {
 public:
  VuePiece(host::Evt* evt, const SortePiece& sorte);
  void debut(host::Evt* evt) override;

 private:
  // What the view shows of `value`, read from column `colonne` (a row's "CODE" for `codeDe`).
  host::Valeur montre(const host::Valeur& value, const char* codeDe);
  void remplirLignes(host::Table& lignes);

  const SortePiece& sorte_;
  host::Field& ident_;
  host::Field& modes_;
  std::vector<host::Field*> champs_;  // in the order of sorte_.champs
};

}  // namespace quarvo::suite
