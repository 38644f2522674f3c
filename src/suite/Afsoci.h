// "AFSOCI": company parameters.
//
// Rule: "LECTURE_CODE" with "SOCIETE" reads the session's own company (the "AFSOCI" row whose
// "CODE" is the session's company); with any other code, that company. "CONTROLER_DATE" (date,
// fiscal year by reference, period by reference): the company's fiscal years are the pairs of
// its "DATE_DEBUT"/"DATE_FIN" lists; the year is the 1-based index of the pair that holds the
// date and the period the month count from that year's first month (1 to 12, or more for a long
// year). It fails, leaving both at 0, when no fiscal year holds the date or the company is unknown.
#pragma once

#include "suite/TableInterface.h"

namespace quarvo::suite {

class Afsoci : public TableInterface {
 public:
  explicit Afsoci(host::Evt* evt);

 private:
  void lectureCode(host::Evt* evt);
  void controlerDate(host::Evt* evt);
};

}  // namespace quarvo::suite
