// `quarvo gen`: fills a database with a coherent synthetic data set for benchmarks and large
// tests, on top of the demo company (its accounting set-up and rights): `services` services
// with one article each, `projects` projects with one budget of one line per service, and
// `pieces` validated supplier orders of `lines` lines each, spread evenly over the projects.
// Identifiers are taken far above the numbering counters, so later numbering never meets them.
#pragma once

#include <cstdint>
#include <iosfwd>

#include "host/session/Session.h"

namespace quarvo::app {

struct GenerateOptions {
  int64_t projects = 100;
  int64_t pieces = 1000;
  int64_t lines = 5;
  int64_t services = 20;
};

// Writes the data set in one transaction; returns the number of rows written.
int64_t generate(host::Session& session, const GenerateOptions& options);
int runGenerate(host::Session& session, const GenerateOptions& options, std::ostream& out);

}  // namespace quarvo::app
