// Helpers of the import tests: staged files written into the test's folder, the load, control
// and generation run by name as the import window runs them, and SQL reads of the results.
#pragma once

#include <fstream>
#include <string>
#include <vector>

#include "host/UException.h"
#include "host/automate/Automate.h"
#include "support/TestSession.h"

namespace quarvo::test {

inline std::filesystem::path ecrireFichier(TestSession& t, const std::string& name,
                                           const std::string& content) {
  auto path = t.dir() / name;
  std::ofstream out(path, std::ios::binary);
  out << content;
  return path;
}

// Rows of a query, columns joined by '|', one row per line, NULL as empty. It runs on the
// test's connection, inside its transaction if one is open, and sees the updates the store
// holds in memory.
inline std::string requete(TestSession& t, const std::string& sql) {
  std::vector<std::vector<std::string>> lignes;
  try {
    lignes = t.db().interroger(sql);
  } catch (const host::UException& e) {
    return std::string("SQL error: ") + e.what();
  }
  std::string out;
  for (const auto& ligne : lignes) {
    for (size_t i = 0; i < ligne.size(); ++i) out += (i ? "|" : "") + ligne[i];
    out += "\n";
  }
  return out;
}

// "IMPORT_CHARGER_TXT" of "COMMUN": returns the error flag (0 loaded).
inline int charger(TestSession& t, const std::string& table, const std::string& path) {
  host::Field flag("FLAG", "", "", 4, host::Kind::Entier, host::Valeur::entier(-1), nullptr);
  host::EvtParamRef evt{host::val(table), host::val(path), host::val(""), host::ref(flag)};
  t.session().appelerProcedure("COMMUN", "IMPORT_CHARGER_TXT", &evt);
  return static_cast<int>(flag.entier());
}

// Runs "QUARVO-<name>" with the caller's error flag by reference; returns the flag.
inline int lancer(TestSession& t, const std::string& name) {
  host::Field flag("FLAG", "", "", 4, host::Kind::Entier, host::Valeur::entier(0), nullptr);
  host::EvtParamRef evt{host::ref(flag)};
  t.session().appelerModule("QUARVO-" + name, &evt);
  return static_cast<int>(flag.entier());
}

// One line of a staged file: the cells joined by tabs.
inline std::string ligne(std::initializer_list<std::string> cells) {
  std::string out;
  for (const auto& c : cells) {
    if (&c != cells.begin()) out += '\t';
    out += c;
  }
  return out + "\n";
}

inline const char* kEnteteFichier =
    "NUMERO_DOC\tDATE_CREATION\tFOURNISSEUR\tAFFAIRE\tBUDGET\tARTICLE\tDESIG\tQTE\tPUHT\t"
    "TAUX_REMISE\tTAUX_TVA\tREFERENCE\tORIGINE\tDEMANDEUR";
// The invoice file's header line.
inline std::string enteteFf() {
  return std::string(kEnteteFichier) + "\tNUMERO\tTYPE\tVALIDE\n";
}
// The header line of quote requests, orders and receipts.
inline std::string enteteAutre() {
  return std::string(kEnteteFichier) + "\tSOLDE\n";
}

}  // namespace quarvo::test
