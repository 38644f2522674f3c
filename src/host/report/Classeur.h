// The export engine's writers: one sheet of typed cells, written row by row, to a text file in
// an exchange format ("EXCEL1": tab-separated UTF-8 text, dates "dd/mm/yyyy", amounts with two
// decimals and a decimal point) or to a real .xlsx workbook when the file name ends in ".xlsx"
// (numbers stay numbers with a "# ##0.00" look, dates are dates, the header row is bold and
// frozen, columns are sized to their contents).
//
// A writer writes into a temporary file beside the target and puts it in place only when
// `fermer` succeeds, so a failed export never leaves a half-written file under the target name.
// Not thread-safe; owned by the export that opened it.
#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "host/value/Valeur.h"

namespace quarvo::host::report {

struct FormatEchange {
  std::string separateur = "\t";
  std::string formatDate = "dd/mm/yyyy";  // or "yyyy-mm-dd"
};

class Classeur {
 public:
  virtual ~Classeur() = default;
  // A writer for `file`: .xlsx by its extension (any case), text otherwise. `append` keeps the
  // rows of an existing text file (a workbook is always written afresh).
  static std::unique_ptr<Classeur> ouvrir(const std::filesystem::path& file,
                                          const FormatEchange& format, bool append);
  static bool estXlsx(const std::filesystem::path& file);

  virtual void entete(const std::vector<std::string>& names) = 0;
  // One row of cells; the values are read, not kept.
  virtual void ligne(const std::vector<const Valeur*>& cells) = 0;
  // Finishes the file; false with the reason in `error` when it could not be written.
  virtual bool fermer(std::string& error) = 0;
};

// The text of one cell in a text exchange file, before the quoting of the exchange format.
std::string texteCellule(const Valeur& v, const FormatEchange& format);

}  // namespace quarvo::host::report
