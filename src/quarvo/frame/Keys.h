// The composite keys of the module's records, built in one place.
//
// Keys are texts joined with "|". A piece line's "NUMERO" starts with its header's "IDENT" and
// "|"; a budget line's with its budget's. The link key "CLE_COMPO" is budget line, component
// table and piece number; "CLE_COMPO2" is component table and component identifier, each followed
// by "|", so all links of one piece are found by prefix whatever their budget line. (The database
// keeps both keys in step with their columns whoever writes the row.) A chaining key "CLE_SRC"
// starts with the source piece's type code and identifier, each followed by "|", so identifier 12
// never matches the rows of identifier 123.
#pragma once

#include <cstdint>
#include <string>

namespace quarvo::frame {

std::string cleCompo(const std::string& aflbudIdent, const std::string& composant,
                     const std::string& piece);
std::string cleCompo2(const std::string& composant, const std::string& composantIdent);
std::string cleChainageSource(int64_t type, const std::string& ident);
std::string numeroLigne(const std::string& headerIdent, const std::string& lineNumber);

}  // namespace quarvo::frame
