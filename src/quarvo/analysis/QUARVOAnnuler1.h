// "QUARVO-ANNULER1": removes every link between one purchasing piece and the project budgets.
//
// Created with the piece's component table and identifier. "DEBUT" reads the company (message
// 14 and nothing cancelled when it cannot). "FAIRE" walks the piece's link rows; for each it
// reads the project, budget line and service (a failed read does not stop the cancellation),
// withdraws the piece from the budget line ("SUPPRESSION_MAJ"), purges the time pointing of the
// link, deletes the link row and has the budget line recomputed without it ("VALIDATION_MAJ").
// The whole cancellation of one piece is one transaction.
#pragma once

#include "host/automate/Traitmnt.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOAnnuler1 : public host::Traitmnt {
 public:
  explicit QUARVOAnnuler1(host::Evt* evt);
  void debut(host::Evt* evt) override;
  void faire(host::Evt* evt) override;
  void annuler_quarvo(host::Evt* evt);
  void suppression_maj_liens(host::Evt* evt);
  void maj_liens(host::Evt* evt);

 private:
  host::Field& composant_;
  host::Field& composantIdent_;
  host::Field& vChoix_;
  host::Table quarvo_;
  host::Table aflbud_;
  host::Champ cComposant_;
  host::Champ cComposantIdent_;
  host::Champ cAfaffaIdent_;
  host::Champ cAflbudIdent_;
  host::Champ cIdent_;
  host::Champ cAfpresIdent_;
};

}  // namespace quarvo
