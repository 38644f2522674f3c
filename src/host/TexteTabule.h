// Tab-separated text, the suite's exchange format ("EXCEL1"), read and written by one rule: the
// loader of import files, the export of reports, the import's error report, and the command
// line's `dump` and `load`. It is the rule spreadsheets follow when they save tab-separated text,
// so a file goes from one to the other and back unchanged.
//
// Rule:
// - cells are separated by the separator (a tab unless an export format names another), records
//   by a line break; a "\r" before a line break is not part of the record;
// - a cell that holds the separator, a line break, a double quote, or that begins or ends with a
//   blank, is written between double quotes, its double quotes doubled; any other cell is written
//   as it is;
// - on reading, the blanks around a cell are not part of it; a cell that begins with a double
//   quote runs to the matching closing quote, and what it holds (separators, line breaks,
//   doubled quotes read as one) is its value; a record whose quoted cell is still open at the end
//   of a line goes on with the next line.
// Plain functions: they own nothing and keep nothing.
#pragma once

#include <istream>
#include <string>
#include <string_view>
#include <vector>

namespace quarvo::host {

std::string celluleTsv(std::string_view value, char separateur = '\t');
// The cells of one record, written by the rule, without the line break.
std::string enregistrementTsv(const std::vector<std::string>& cellules, char separateur = '\t');
// The cells of one record (the line breaks inside quoted cells included).
std::vector<std::string> cellulesTsv(std::string_view enregistrement, char separateur = '\t');
// Splits `texte` into `cellules`; false when it ends inside a quoted cell, that is when the record
// goes on with the next line.
bool decouperTsv(std::string_view texte, std::vector<std::string>& cellules,
                 char separateur = '\t');
// Reads the next record of `in` into `enregistrement` (one line, or several when a quoted cell
// spans them); `lignes` receives how many lines it took. False at the end of the stream.
bool lireEnregistrementTsv(std::istream& in, std::string& enregistrement, size_t& lignes);

}  // namespace quarvo::host
