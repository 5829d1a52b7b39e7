// The folder of the running program, where the module file sits by default.
#pragma once

#include <string>

namespace Runner {

std::string ProgramFolder(const char* argv0);

}  // namespace Runner
