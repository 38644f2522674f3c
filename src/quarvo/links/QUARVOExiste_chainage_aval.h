// "QUARVO-EXISTE_CHAINAGE_AVAL": has a purchasing piece been carried forward into a later piece
// (an order into a receipt or an invoice, a receipt into an invoice), and into which one?
//
// Created with the source piece's type code and identifier (by value) and two result fields (by
// reference); "FAIRE" reads the chaining table and hands back the type code and identifier of
// the downstream piece, or 0 and an empty identifier with a failed outcome when there is none.
// When several downstream pieces exist, the last row of the selection (highest key) answers.
// The automaton ends after one answer.
#pragma once

#include "host/automate/Traitmnt.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOExiste_chainage_aval : public host::Traitmnt {
 public:
  explicit QUARVOExiste_chainage_aval(host::Evt* evt);
  void faire(host::Evt* evt) override;

 private:
  host::Field& type_;
  host::Field& ident_;
  host::Field& typeCible_;
  host::Field& identCible_;
  host::Table chainage_;
  host::Champ cleSrc_;
  host::Champ typeDst_;
  host::Champ ideDst_;
};

}  // namespace quarvo
