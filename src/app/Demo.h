// `quarvo demo`: builds a demo database in a fresh folder and walks through what the module
// does so far, in words a user follows. The database stays there to be opened afterwards.
#pragma once

#include <iosfwd>
#include <string>

namespace quarvo::app {

int runDemo(const std::string& dir, std::ostream& out, std::ostream& err);

}  // namespace quarvo::app
