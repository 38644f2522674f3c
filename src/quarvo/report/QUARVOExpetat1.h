// "QUARVO-EXPETAT1": the purchase follow-up of "M_APPR1" written to a spreadsheet file, one
// output row per report row, grouped by criterion, project, budget and budget line, the line's
// own row (type "0") before its pieces.
//
// Each row carries the project's, budget's and budget line's labels and two running amounts of
// its budget line: "V_DISPONIBLE" (budget less orders) and "V_SOLDE" (orders less invoices),
// both restarted at each budget line and never below 0. The file is tab-separated text
// ("EXCEL1"), or a real workbook when its name ends in ".xlsx". The labels are read once per
// project, budget and budget line; a piece row's kind is the component its type stands for. Created
// with the file name (parameter 0, by value).
#pragma once

#include "host/automate/Export.h"
#include "host/table/Champ.h"

namespace quarvo {

class QUARVOExpetat1 : public host::Export {
 public:
  explicit QUARVOExpetat1(host::Evt* evt);

  void debut(host::Evt* evt) override;
  void pour_tout(host::Evt* evt) override;

 private:
  std::string libelle(const std::string& key);
  bool lire(const std::string& module, const std::string& ident);

  host::Field& pFichier_;
  host::Field& vLibel_;
  host::Field& vLibPiece1_;
  host::Field& vLibPiece2_;
  host::Field& vAfaffaDesig_;
  host::Field& vBudget_;
  host::Field& vBudgetDesig_;
  host::Field& vPrestation_;
  host::Field& vPrestationDesig_;
  host::Field& vType_;
  host::Field& vPiece_;
  host::Field& vDatePiece_;
  host::Field& vDisponible_;
  host::Field& vSolde_;
  host::Field& vPrestationEnCours_;

  host::Table iAfaffa_;
  host::Table iAfebud_;
  host::Table iAflbud_;

  // Identifiers whose record is current in "I_AFAFFA", "I_AFEBUD", "I_AFLBUD": the rows come
  // grouped, so each project, budget and line is read once per run.
  std::string affaireLue_;
  std::string budgetLu_;
  std::string ligneLue_;
};

}  // namespace quarvo
