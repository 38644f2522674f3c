// Tab-separated rows in and out of a table, through the runtime's cursors.
//
// The first record names the columns; each further record is one row, written and read by the
// tab-separated text rule of the exchange format (host/TexteTabule.h: a value holding a tab, a
// line break or a quote is quoted). Dates are written dd/mm/yyyy and read in that form or ISO;
// amounts with a decimal point (a comma is read too). A load is all or nothing: the first bad
// line stops it with a message naming the file, line, column and value.
#pragma once

#include <istream>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

#include "host/session/Session.h"

namespace quarvo::app {

// Loads `in` (named `source` in messages) into `table`; returns the rows loaded.
// Throws UsageError on the first bad line, having loaded nothing.
size_t loadTsv(host::Session& session, const std::string& table, std::istream& in,
               const std::string& source);
// Prints the rows of `table` matching every COL=VALUE filter, in key order; returns the count.
size_t dumpTsv(host::Session& session, const std::string& table,
               const std::vector<std::pair<std::string, std::string>>& where, std::ostream& out);

}  // namespace quarvo::app
