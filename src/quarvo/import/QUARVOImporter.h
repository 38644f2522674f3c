// "QUARVO-IMPORTER": the window from which a user imports purchase pieces from text files.
//
// The user names up to four files, one per kind (quote requests, orders, goods-received notes,
// invoices), chooses control only ("V_MODE" 0) or control and import (1), and validates. A kind
// whose import setting ("AFPARA" "IMPORT_03".."IMPORT_06", "PARAM1" 'O') is off cannot be
// chosen and is never imported; an allowed kind starts with the setting's default file. The
// validation refuses, leaving the window open on the faulty field, when no file is named, the
// exchange format "EXCEL1" is missing or not "TXT", or a named file does not end in "txt" (any
// case) or does not exist; then nothing is imported. Otherwise each named file is loaded,
// controlled and (in import mode) generated, and deleted when its kind was clean from load to
// generation; a summary message follows, with the error list when errors were found, and the
// window closes. Paths are used as given: file names are case-sensitive here.
#pragma once

#include <array>

#include "host/automate/Fenetre_simple.h"
#include "host/table/Table.h"

namespace quarvo {

class QUARVOImporter : public host::Fenetre_simple {
 public:
  explicit QUARVOImporter(host::Evt* evt);

  void debut(host::Evt* evt) override;
  void validation(host::Evt* evt) override;
  void choisir(host::Evt* evt, size_t kind);

 private:
  void message(const char* number, std::vector<std::string> args = {});
  void refuser(host::Evt* evt, const std::string& control);

  std::array<host::Field*, 4> fichiers_{};
  host::Field& vMode_;
  host::Field& vDossier_;
  host::Field& vOk_;
  host::Field& vExtension_;
  std::array<host::Field*, 4> erreurs_{};
  host::Field& vChoix_;
  host::Field& vErreurGeneration_;
  host::Table immDf_;
  host::Table immCf_;
  host::Table immBf_;
  host::Table immFf_;
  host::Table immErreur_;
  host::Table afpara_;
  host::Table formats_;
};

}  // namespace quarvo
