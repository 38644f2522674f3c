// "AFEFFO": the time entries of the personnel services (table "AFEFFO", lines "AFLFFO" whose
// "NUMERO" is the entry's "IDENT" | rank, one line per project and service). The module owns
// both tables; the project links read and choose its entries.
//
// Rule: the generic reads ("LECTURE" by "IDENT", "LECTURE_NUMERO_DOC" by number). Besides:
// - "AFFECTE_PARAMETRES" (text, project code): remembers the project for the next "CHOIX" (see
//   ChoixPieces.h).
// - "CHOIX" (entry identifier by reference): offers the entries having a line on the remembered
//   project (a line's "AFAFFA_IDENT" is the identifier of the "AFAFFA" row with that code).
//   Chosen: parameter 0 becomes the entry's identifier and the call succeeds. Nothing chosen, no
//   project remembered, an unknown project or no entry to offer (then nobody is asked): the
//   call fails and parameter 0 keeps its value.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Afeffo : public TableInterface {
 public:
  explicit Afeffo(host::Evt* evt);

 private:
  void choix(host::Evt* evt);
};

}  // namespace quarvo::suite
