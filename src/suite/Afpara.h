// "AFPARA": parameters of the project module, and the purchase grouping.
//
// Rule: "LECTURE_CODE" reads the parameter row by "CODE" (generic). "REGROUPEMENT_ACHAT"
// (criterion, article, criterion 1, criterion 2, criterion 3, service by reference) finds the
// service ("AFPRES") that purchases of an article belong to, from the grouping table
// "AFREGACH" ("CRITERE", "CLE_IDENT", "AFPRES_IDENT"): with criterion 1, 2 or 3 the key is the
// article's criterion of that rank; with any other criterion (0, empty) the key is the article
// itself. The row with that criterion and key gives the service. It fails, leaving the service
// empty, when there is no such row or the key is empty.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Afpara : public TableInterface {
 public:
  explicit Afpara(host::Evt* evt);

 private:
  void regroupementAchat(host::Evt* evt);
};

}  // namespace quarvo::suite
