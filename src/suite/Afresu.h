// "AFRESU": the project results by project, purchase post and year-month ("AFRESU" table).
//
// Rule: "MAJ_AFRESU" takes every record of the memory table "M_RESU1" ("AFAFFA_IDENT",
// "AFPOST_CODE", "ANNEE_MOIS" as yyyymm, "TYPE", "VENG") and empties it. A record's "VENG" is the
// change of the amount still to commit on the post, so it is subtracted from the committed
// amount "VENG" of the results row with the same key (created when missing): an order linked
// with amount 100 arrives as -100 and raises the committed amount by 100; its withdrawal
// arrives as 100 and lowers it again. "CALCUL_RAF_D" (project, post, yyyymm) recomputes the
// period's row of type "D": "VBUD_D" is the sum of the budgeted amounts of the project's budget
// lines whose service has that purchase post, "VREA" the sum of their realised amounts
// ("VREA" first value), "VRAF_D" what remains, never below 0.
#pragma once

#include "host/automate/Interface2.h"

namespace quarvo::suite {

class Afresu : public host::Interface2 {
 public:
  bool reutilisable() const override { return true; }  // keeps nothing between calls
  explicit Afresu(host::Evt* evt);

 private:
  void majAfresu(host::Evt* evt);
  void calculRafD(host::Evt* evt);
};

}  // namespace quarvo::suite
