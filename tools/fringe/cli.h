// The command line: subcommands, options, --help and --version.
#pragma once

#include <optional>

#include "options.h"

namespace Fringe {

// Parses the command line. Returns the options to run with, or sets exitCode
// (0 after --help or --version, kExitUsage after an error, already printed).
std::optional<Options> ParseCommandLine(int argc, char** argv, int& exitCode);

}  // namespace Fringe
