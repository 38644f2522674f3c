// The "import" command: purchase pieces from text files, as the import window or the
// automatic import does it.
//
//   quarvo import [--df F] [--cf F] [--bf F] [--ff F] [--check-only]
//   quarvo import --auto
//
// With files, the import window is opened, given exactly those files (the other kinds stay
// empty) and validated, in control-only mode with --check-only; its messages go through the
// session's driver, among them the window's error list when errors were found. With --auto, the
// automatic import runs on the default files of the import settings and the command says where
// its error report went. Exit code 0 when everything was clean, 1 when errors were found or the
// window refused the files.
#pragma once

#include <ostream>
#include <string>

#include "host/session/Session.h"

namespace CLI {
class App;
}

namespace quarvo::app {

struct ImportOptions {
  std::string df;
  std::string cf;
  std::string bf;
  std::string ff;
  bool checkOnly = false;
  bool automatique = false;
};

// Declares the "import" subcommand and its options on `cli`, filling `options`.
CLI::App* addImportCommand(CLI::App& cli, ImportOptions& options);

// Runs the import in `session` (which must be current); returns the exit code.
int runImport(host::Session& session, const ImportOptions& options, std::ostream& out);

}  // namespace quarvo::app
