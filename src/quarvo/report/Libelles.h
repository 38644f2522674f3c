// Texts the follow-up report builds the same way when printed and when exported.
#pragma once

#include <string>

namespace quarvo::report {

// The chapter prefix of a budget line: "2)" gives "2) ", "2" gives "2) ", none gives "".
std::string prefixeChapitre(const std::string& chapitre);

// The origin caption of a budget: the customer-quote label for "GCPEDEV", the customer-order
// label for "GCPECOM", each followed by a space; nothing for another origin or for a budget
// entered by hand (number "MANUEL").
std::string legendeOrigine(const std::string& piece, const std::string& origine,
                           const std::string& libDevis, const std::string& libCommande);

}  // namespace quarvo::report
