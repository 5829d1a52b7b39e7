// One soak run, made entirely from its seed: a random synthetic page, a host
// with random faults in its procedures and tables, a whole run in host order,
// and the checks on what the module did.
#pragma once

#include <cstdint>
#include <string>

#include "standin/module.h"

namespace Soak {

// A small, fast generator whose sequence is the same on every platform.
class Rng {
 public:
  explicit Rng(uint64_t seed) : state_(seed) {}
  uint64_t Next();
  // A value in [low, high].
  int32_t Range(int32_t low, int32_t high);
  bool Chance(int percent) { return Range(0, 99) < percent; }

 private:
  uint64_t state_;
};

// The seed of run `index` of a soak started from `base`.
uint64_t RunSeed(uint64_t base, int64_t index);

// What the runs came to, for the closing report.
struct Tally {
  int64_t runs = 0;
  int64_t faulted = 0;       // runs with at least one host fault
  int64_t photos = 0;        // runs whose record holds confidence 255
  int64_t failedRuns = 0;    // runs in which some selector answered non-zero
  int64_t survivors = 0;     // runs that ended at a failing continue, object alive
  int64_t excusedLeaks = 0;  // leaks after a fault that keeps the host from taking memory back
  int64_t handlesMade = 0;   // host handles the module was given, over all runs
};

struct RunOutcome {
  std::string what;     // the page, the faults and the plan, for a failure message
  std::string failure;  // empty when every check held
};

// Runs the run of `seed` against the loaded module.
RunOutcome SoakRun(Standin::Module& module, uint64_t seed, Tally& tally);

// Ends whatever run the module still has in progress with a lone finish from a
// host of its own; answers a failure text, or empty.
std::string EndRunInProgress(Standin::Module& module);

}  // namespace Soak
