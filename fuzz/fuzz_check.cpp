// Invariant checks shared by the fuzz targets.
#include "fuzz_check.h"

#include <cstdio>
#include <cstdlib>

namespace Fuzz {

namespace {

bool IsLeak(const std::string& problem) {
  return problem.rfind("leaked ", 0) == 0 ||
         problem.find("opened and never closed") != std::string::npos ||
         problem.find("never disposed") != std::string::npos ||
         problem.find("never freed") != std::string::npos;
}

bool Disposes(Standin::Proc proc) {
  using Standin::Proc;
  return proc == Proc::HandleDispose || proc == Proc::HandleUnlock || proc == Proc::BufferFree ||
         proc == Proc::BufferUnlock || proc == Proc::SuiteBufferDispose ||
         proc == Proc::SuiteRelease || proc == Proc::DescriptorClose || proc == Proc::RecordDelete;
}

}  // namespace

void Fail(const std::string& what) {
  std::fprintf(stderr, "fuzz invariant broken: %s\n", what.c_str());
  std::fflush(stderr);
  std::abort();
}

RunFaults::RunFaults() : codes_{0, 1, -50, -108, -109, -128} {}

namespace {
// FRINGE_FUZZ_VERBOSE=1 shows the faults of each input, for reading a finding.
void Tell(const char* what, Standin::Proc proc, int32_t error) {
  static const bool verbose = std::getenv("FRINGE_FUZZ_VERBOSE") != nullptr;
  if (verbose) std::fprintf(stderr, "fault: %s %s %d\n", what, Standin::ProcName(proc), error);
}
}  // namespace

void RunFaults::Removed(Standin::Proc proc) {
  Tell("removed", proc, 0);
  if (proc == Standin::Proc::DescriptorClose) closeMissing_ = true;
}

void RunFaults::Failing(Standin::Proc proc, int32_t error) {
  Tell(error == 0 ? "raising" : "failing", proc, error);
  if (proc == Standin::Proc::RecordGet || proc == Standin::Proc::RecordDelete) {
    hostKeepsRecords_ = true;
  }
  if (error != 0) codes_.insert(error);
  // A raise unwinds through the module from wherever it happens; not every
  // path that unwinds gives back what it holds (see the report).
  if (Disposes(proc) || error == 0) disposalBroken_ = true;
  if (proc == Standin::Proc::DescriptorClose) closeMissing_ = true;
}

void RunFaults::Shaped(Standin::Table table) {
  if (std::getenv("FRINGE_FUZZ_VERBOSE") != nullptr) {
    std::fprintf(stderr, "fault: table %d shaped\n", static_cast<int>(table));
  }
  // A shortened write table can keep open while losing close.
  if (table == Standin::Table::DescriptorWrite) closeMissing_ = true;
}

void RunFaults::CheckResult(int16_t result, const std::string& where) const {
  Check(codes_.count(result) != 0, where + " answered " + std::to_string(result) +
                                       ", neither 0, 1 nor a code the host produced");
}

void RunFaults::CheckProblems(const Standin::ProblemLog& problems, bool hostOrder,
                              const std::string& where) const {
  for (const std::string& problem : problems.All()) {
    if (IsLeak(problem)) {
      if (!hostOrder || disposalBroken_) continue;
      if (closeMissing_ && problem.find("descriptor write token") != std::string::npos) continue;
    }
    Fail(where + ": " + problem);
  }
}

}  // namespace Fuzz
