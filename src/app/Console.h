// Helpers shared by the command-line commands: aligned text tables (widths counted in
// characters, since designations are French) and the piece named on the command line.
#pragma once

#include <iosfwd>
#include <string>
#include <vector>

namespace quarvo::app {

using TextRow = std::vector<std::string>;

// Prints `heading` then `rows`, columns aligned, two spaces apart.
void printTable(std::ostream& out, const TextRow& heading, const std::vector<TextRow>& rows);

struct PieceArg {
  std::string table;   // "GAPECOM", "GAPEBL", "GAPEFAC"
  std::string ident;   // header "IDENT"
  std::string numero;  // header "NUMERO_DOC"
};

// KIND is the header table or its short code (CF, BF, FF), in any case; IDENT the piece's
// identifier or document number. Throws UsageError for an unknown kind or piece.
PieceArg findPiece(const std::string& kind, const std::string& ident);

}  // namespace quarvo::app
