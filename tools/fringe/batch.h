// Running fringe over every page it was given: expanding folders, skipping
// pages the results file already holds, processing in this process or in
// worker processes, reporting each page in input order, and the exit code.
#pragma once

#include "options.h"

namespace Fringe {

int RunBatch(const Options& options);

}  // namespace Fringe
