// "<MODULE>-SOLDER" for "GAPECOM", "GAPEBL", "GAPEFAC": settles a piece, closing what it still
// expects, through the settling services of the purchasing side ("GCPFOUR", "GCPX", see
// Settling.h), which own what they write. One implementation; the kinds are in their table of
// differences (SortesPiece.h).
//
// Rule: created with the piece's identifier. The supplier service opens the settling
// ("DEBUT_SOLDE": the piece's supplier must exist); every line of the piece is settled for
// what it did not carry forward ("GCPX" "SOLDE_LIGNE": "QTE_SOLDEE" = "QTE" - "QTT"); the
// header expects nothing more ("GCPX" "SOLDE_PIECE": "QTNT" = 0) and is marked settled
// ("GCPFOUR" "SOLDE_PIECE": "SOLDEE" = 1, its settled amounts being what it carried forward,
// "MTNT_HT"/"MTNT_TTC" as they stand, its update stamp renewed); both services then close the
// settling. All of it is one transaction. The call fails, settling nothing, when the piece
// does not exist or a service refuses a step. Settling a settled piece again changes nothing
// but the stamp.
#pragma once

#include <vector>

#include "host/automate/Traitmnt.h"
#include "suite/SortesPiece.h"

namespace quarvo::suite {

class SoldePiece : public host::Traitmnt {
 public:
  SoldePiece(host::Evt* evt, const SortePiece& sorte);
  void faire(host::Evt* evt) override;

 private:
  bool solder();
  // `label` of `module`'s interface with `args`; true when it succeeded.
  bool service(const char* module, const char* label, std::vector<host::Arg> args);

  const SortePiece& sorte_;
  host::Field& ident_;
};

}  // namespace quarvo::suite
