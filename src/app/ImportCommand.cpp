#include "app/ImportCommand.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <filesystem>

#include "app/PiloteEcran.h"
#include "app/Workspace.h"
#include "host/automate/Automate.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"
#include "quarvo/import/QUARVOImporter_auto.h"

namespace quarvo::app {

using namespace host;
namespace fs = std::filesystem;

CLI::App* addImportCommand(CLI::App& cli, ImportOptions& o) {
  auto* import = cli.add_subcommand(
      "import", "Import purchase pieces from tab-separated text files (format EXCEL1)");
  import->add_option("--df", o.df, "File of supplier quote requests");
  import->add_option("--cf", o.cf, "File of supplier orders");
  import->add_option("--bf", o.bf, "File of goods-received notes");
  import->add_option("--ff", o.ff, "File of supplier invoices and credit notes");
  import->add_flag("--check-only", o.checkOnly, "Control the files without importing them");
  auto* automatic = import->add_flag(
      "--auto", o.automatique,
      "Import the default files of the import settings (AFPARA IMPORT_03..06) unattended");
  for (const char* name : {"--df", "--cf", "--bf", "--ff", "--check-only"}) {
    automatic->excludes(name);
  }
  return import;
}

namespace {

std::string dernierNumeroErreur() {
  Table err(nullptr, "VOVOVA", "IMM_ERREUR", "COMMANDE");
  err.effacerCriteres();
  return err.lire(4) == 0 ? err.valeur("IDENT").toChaine() : std::string();
}

// The error rows numbered after `after` (those of this run).
int64_t erreursApres(const std::string& after) {
  Table err(nullptr, "VOVOVA", "IMM_ERREUR", "COMMANDE");
  err.effacerCriteres();
  if (!after.empty()) err.ajouterCritere("IDENT", '+', Valeur::chaine(after + "\x01"));
  return err.compter();
}

int importAuto(Session& session, std::ostream& out) {
  fs::path report = QUARVOImporter_auto::cheminRapport(session.societe(), Date::today());
  std::error_code ec;
  auto sizeBefore = fs::exists(report, ec) ? fs::file_size(report, ec) : 0;
  EvtParamVal none;
  int outcome = session.appelerModule("QUARVO-IMPORTER_AUTO", &none);
  session.executerEnAttente();
  auto sizeAfter = fs::exists(report, ec) ? fs::file_size(report, ec) : 0;
  if (outcome != 0) {
    out << "errors were found but the report " << report.string()
        << " could not be written: they stay in the error table\n";
    return 1;
  }
  if (sizeAfter != sizeBefore) {
    out << "errors were found: report written to " << report.string() << "\n";
    return 1;
  }
  out << "import done without error (no report written)\n";
  return 0;
}

}  // namespace

int runImport(Session& session, const ImportOptions& o, std::ostream& out) {
  if (o.automatique) return importAuto(session, out);
  const std::array<std::pair<const char*, std::string>, 4> files{{{"V_FICHIER_DF", o.df},
                                                                  {"V_FICHIER_CF", o.cf},
                                                                  {"V_FICHIER_BF", o.bf},
                                                                  {"V_FICHIER_FF", o.ff}}};
  if (std::all_of(files.begin(), files.end(), [](const auto& f) { return f.second.empty(); })) {
    throw UsageError("name at least one file (--df, --cf, --bf, --ff) or use --auto");
  }
  std::string before = dernierNumeroErreur();
  UiDriver& terminal = session.ui();
  ModeleEcran model(session, &terminal, true);
  if (model.ouvrir("QUARVO-IMPORTER") != ModeleEcran::Ouverture::Ouverte) {
    throw UsageError("the import window could not be opened");
  }
  PiloteEcran window(model, terminal);
  // Exactly the files given: a kind not given is emptied of its default file.
  for (const auto& [field, path] : files) {
    if (!window.actif(field)) {
      if (path.empty()) continue;
      out << "the import of " << std::string(field).substr(10)
          << " files is switched off in the settings (AFPARA): " << path << " is not imported\n";
      continue;
    }
    if (!window.saisir(field, path)) {
      throw UsageError("the import window refuses " + path + ": " + window.refus());
    }
  }
  window.saisir("V_MODE", o.checkOnly ? "0" : "1");
  window.presser("VALIDATION");
  if (window.ouverte()) {
    out << "the files were refused: nothing was imported\n";
    model.fermerTout();
    return 1;
  }
  // The window has closed: its error flags are read from what it held when it closed.
  int64_t errors = model.resultatFerme() != 0 ? 1 : 0;
  for (const char* field : {"V_ERREUR_DF", "V_ERREUR_CF", "V_ERREUR_BF", "V_ERREUR_FF"}) {
    auto it = model.champsFermes().find(field);
    if (it != model.champsFermes().end() && it->second != "0") ++errors;
  }
  // The window has shown this run's errors in its error list: they are not printed again.
  int64_t recorded = erreursApres(before);
  if (errors == 0 && recorded == 0) {
    out << (o.checkOnly ? "control done without error\n" : "import done without error\n");
  }
  return errors == 0 && recorded == 0 ? 0 : 1;
}

}  // namespace quarvo::app
