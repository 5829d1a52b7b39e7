// Running the built fringe program as a user would, capturing what it prints,
// its exit code and its peak memory.
#pragma once

#include <string>
#include <vector>

#include <nlohmann/json.hpp>

namespace FringeTest {

struct RunOutcome {
  int exitCode = -1;  // -1 when killed by a signal
  int signal = 0;
  std::string out;         // standard output
  std::string err;         // standard error
  long peakKilobytes = 0;  // the program's maximum resident set size

  // Standard output read as JSON Lines.
  std::vector<nlohmann::json> JsonLines() const;
};

// The whole content of a file; empty when it cannot be read.
std::string ReadFile(const std::string& path);

// The fringe program and module under test (set by the build).
std::string FringeProgram();
std::string FringeModule();
// A module file that aborts on pages of odd width and publishes nothing on others.
std::string CrashingModule();
// A module that crashes at prepare on pages whose width ends in 1, hangs on
// those whose width ends in 3, and passes every other call on to the module
// named by FRINGE_FORWARD_MODULE.
std::string BrokenModule();

// Runs fringe with args in folder cwd (empty: the current one).
RunOutcome RunFringe(const std::vector<std::string>& args, const std::string& cwd = "");

// Starts fringe without waiting, its output going to the files named.
int StartFringe(const std::vector<std::string>& args, const std::string& outPath,
                const std::string& errPath);
// Waits for a started fringe; returns its wait status.
int WaitFringe(int pid);

}  // namespace FringeTest
