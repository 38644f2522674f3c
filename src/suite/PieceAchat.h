// The interface of the piece modules the project links read and choose: "GAPECOM" (orders),
// "GAPEBL" (goods-received notes), "GAPEFAC" (invoices). Besides the generic reads and the
// generation protocol of `PieceGeneration`, the choice of a piece of one project and the rights
// on transforming a piece. The module owns its header and line tables; the rights are
// "SYSDROIT"'s.
//
// Rule:
// - "AFFECTE_PARAMETRES" (text, project code): remembers the project for the module's next
//   choices (see ChoixPieces.h).
// - "CHOISIR" (piece identifier by reference): offers the module's pieces of the remembered
//   project. A piece belongs to the project when its header's "SECAN_CODE" is the project's
//   code, or, its header's being empty, when one of its lines' "SECAN_CODE" is (a header's
//   section wins over its lines'). Chosen: parameter 0 becomes the chosen piece's identifier and
//   the call succeeds. Nothing chosen, no project remembered or no piece to offer (then nobody
//   is asked): the call fails and parameter 0 keeps its value. The identifier given is only
//   the result: a choice list has no starting row, so all the project's pieces are offered.
// - "DROIT_TRANSFORMATION_DOC" (piece identifier, modes by reference): keeps of the modes the
//   letters the session's user holds, compared as "SYSDROIT" "COMPARE_DROIT" compares ("MC"
//   with rights "VCI" gives "C"). The rights are the user's in the application whose "CODE" is
//   the module ("SYSAPPLI"), or, when the suite has no such application, in the project
//   application "DOVERUVA"; a user without rights there keeps no letter. It fails, leaving the
//   modes, when the piece does not exist.
#pragma once

#include "suite/PieceGeneration.h"

namespace quarvo::suite {

class PieceAchat : public PieceGeneration {
 public:
  explicit PieceAchat(host::Evt* evt);

 private:
  void choisir(host::Evt* evt);
  void droitTransformation(host::Evt* evt);
  // The rights text of the session's user for this module ("" when none).
  std::string droits();
};

}  // namespace quarvo::suite
