// Export of a report to a file: the export engine walks the automaton's main table in the
// order of its sort plan and raises "POUR_TOUT" once per row; the handler prepares the row's
// working fields and hands the event to `Export::pour_tout`, which writes one output row of
// the declared zones.
//
// Set-up, in the constructor: `nomBase`, `fichier` (the output file), `format` (an exchange
// format of the "FRMT" table, "EXCEL1" being tab-separated text), `mode` ("S" the file is
// written afresh, otherwise rows are added to an existing text file; "I" a first row of zone
// names), `nomTable` (the main table), `planTri` (sort entries "TABLE.COLUMN") and `zones`
// (output columns, in order: a field of the automaton of that name, else the column of the
// main table's current row). A file name ending in ".xlsx" gives a real workbook.
//
// Sort plan: entries compare values of their kind; texts compare digit runs as numbers
// ("0000000201|2" before "0000000201|10"). An entry on the table's own key "IDENT" makes the
// order total: it is applied after the other entries, so it only breaks ties. An entry
// "<PREFIX>_UNIQ" that is no column of the table stands for the identifier "<PREFIX>_IDENT".
//
// Driven: "INIT", "DEBUT", the rows, then "FIN", each when bound; the export then ends. When
// the file cannot be written the outcome fails and the session's driver is told why.
#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "host/automate/Automate.h"
#include "host/table/Table.h"

namespace quarvo::host {

namespace report {
class Classeur;
}

class Export : public Automate {
 public:
  explicit Export(Evt* creating);
  ~Export() override;

  void fichier(std::string file) { file_ = std::move(file); }
  const std::string& fichier() const { return file_; }
  void format(std::string code) { format_ = std::move(code); }
  void mode(std::string mode) { mode_ = std::move(mode); }
  void planTri(const std::string& name, std::vector<std::string> entries);
  void zones(std::vector<std::string> names) { zones_ = std::move(names); }

  // The main table's cursor, on the current row during "POUR_TOUT".
  Table& courant();
  // Writes the current row.
  void pour_tout(Evt* evt) override;
  void executer(Evt* evt) override;
  int64_t lignesEcrites() const { return written_; }

 private:
  bool ouvrirFichier();

  std::string file_;
  std::string format_ = "EXCEL1";
  std::string mode_ = "SI";
  std::vector<std::string> sort_;
  std::vector<std::string> zones_;
  std::unique_ptr<Table> cursor_;
  std::unique_ptr<report::Classeur> out_;
  // Each zone, found once per export: a field of the automaton, else a column of the table.
  struct Zone {
    Field* champ = nullptr;
    std::string colonne;
  };
  std::vector<Zone> zonesTrouvees_;
  std::vector<const Valeur*> cellules_;
  int64_t written_ = 0;
};

// Orders two values the way sort plans do (texts with digit runs compared as numbers).
int comparerTri(const Valeur& a, const Valeur& b);

}  // namespace quarvo::host
