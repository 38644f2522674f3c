// "QUARVO-IMPORTER_AUTO": the unattended import of the default files of the allowed kinds.
//
// For each kind whose import setting is on ("AFPARA" "IMPORT_03".."IMPORT_06": "PARAM1" 'O')
// and whose default file ("PARAM2") exists, the file is loaded, controlled and generated, and
// deleted when its kind was clean from load to generation. When the error table then holds
// rows, they are saved to the day's report file under the database folder
// (VOVOVA/<company>.$so/rapports/ierreurs_ach_<ddmmyyyy>.txt; several runs of one day add to
// the same file) and the error table is emptied, only once the report was written. Nothing is
// shown to a user.
#pragma once

#include <array>
#include <filesystem>

#include "host/automate/Traitmnt.h"
#include "host/table/Table.h"
#include "host/value/Date.h"

namespace quarvo {

class QUARVOImporter_auto : public host::Traitmnt {
 public:
  explicit QUARVOImporter_auto(host::Evt* evt);

  void debut(host::Evt* evt) override;
  void faire(host::Evt* evt) override;

  // The error report of `company` for `day`.
  static std::filesystem::path cheminRapport(const std::string& company, const host::Date& day);

 private:
  std::array<host::Field*, 4> fichiers_{};
  host::Field& vErreur_;
  host::Field& vFichier_;
  host::Field& vErreurGeneration_;
  host::Table immDf_;
  host::Table immCf_;
  host::Table immBf_;
  host::Table immFf_;
  host::Table immErreur_;
  host::Table afpara_;
};

}  // namespace quarvo
