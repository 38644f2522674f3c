// The quarvo command line: parses the arguments, opens the database and the session, runs one
// command and returns the process exit code (0 success, 1 a business result that calls for
// attention, such as a failed outcome, 2 a usage or environment error).
#pragma once

#include <iosfwd>

namespace quarvo::app {

int runCommandLine(int argc, char** argv, std::ostream& out, std::ostream& err);

}  // namespace quarvo::app
