// "QUARVO-IMPUTER_AUTO": the unattended imputation. It points every piece created up to the
// end of the company's current month, of every kind and project, with arbitration, and then
// writes the link rows. The work tables are emptied before the pointing (the writer adds to
// link rows, so an earlier proposal left in them would be booked twice); the error table is
// left alone, since it also holds import errors waiting for their report.
#pragma once

#include "host/automate/Traitmnt.h"
#include "host/table/Table.h"

namespace quarvo {

class QUARVOImputer_auto : public host::Traitmnt {
 public:
  explicit QUARVOImputer_auto(host::Evt* evt);

  void debut(host::Evt* evt) override;
  void faire_selection(host::Evt* evt);
  void faire(host::Evt* evt) override;

 private:
  host::Field& vDateMin_;
  host::Field& vDateMax_;
  host::Field& vTypePiece_;
  host::Field& vArbitrage_;
  host::Field& mo_;
  host::Field& an_;
  host::Field& vDebMo_;
  host::Field& vFinMo_;
  host::Table iAfsoci_;
};

}  // namespace quarvo
