// The documented exit codes of fringe and how page outcomes rank among them.
#pragma once

namespace Fringe {

enum ExitCode : int {
  kExitOk = 0,           // every page had a photo
  kExitNoPhoto = 1,      // at least one page had no photo (and nothing worse happened)
  kExitBadInput = 2,     // at least one input could not be read, decoded or was refused
  kExitUsage = 64,       // the command line was wrong
  kExitInternal = 70,    // the module could not be loaded or run, or a worker died
  kExitCannotWrite = 73  // an output file could not be written
};

// A batch exits with its most serious page outcome.
inline int Severity(int code) {
  switch (code) {
    case kExitOk:
      return 0;
    case kExitNoPhoto:
      return 1;
    case kExitBadInput:
      return 2;
    case kExitCannotWrite:
      return 3;
    case kExitInternal:
      return 4;
    default:
      return 5;
  }
}

inline int WorseExit(int a, int b) {
  return Severity(b) > Severity(a) ? b : a;
}

}  // namespace Fringe
