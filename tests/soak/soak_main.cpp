// The soak: thousands of consecutive runs in one loaded module, each from its
// own seed (a random page, random host faults), checking every run and, at the
// end, that the process's resident memory stayed flat.
//
//   fringe-soak [--runs N] [--seed S] [--rss-bound-mib M] [--replay SEED ...]
//
// FRINGE_SOAK_RUNS overrides --runs (the full soak: 10000 native, 1000 under
// Wine). A failing run prints its seed and the seeds to replay it with.
#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "resident_memory.h"
#include "soak_run.h"
#include "standin/module.h"

namespace {

struct Options {
  int64_t runs = 1000;
  uint64_t seed = 20261206;
  uint64_t rssBoundMiB = 8;
  std::vector<uint64_t> replay;  // seeds run in order instead of a soak
};

void SetVariable(const char* name, const char* value) {
#ifdef _WIN32
  _putenv_s(name, value);
#else
  setenv(name, value, 1);
#endif
}

std::string ModulePath() {
  if (const char* path = std::getenv("FRINGE_MODULE"); path != nullptr && *path != '\0') {
    return path;
  }
  std::string path = FRINGE_MODULE_PATH;
#ifdef _WIN32
  if (!path.empty() && path[0] == '/') path = "Z:" + path;  // a Unix path seen through Wine
#endif
  return path;
}

bool ParseNumber(const char* text, uint64_t& value) {
  char* end = nullptr;
  value = std::strtoull(text, &end, 0);
  return end != text && *end == '\0';
}

bool Parse(int argc, char** argv, Options& o) {
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    uint64_t value = 0;
    if (arg == "--replay") {
      while (i + 1 < argc && ParseNumber(argv[i + 1], value)) {
        o.replay.push_back(value);
        ++i;
      }
      if (o.replay.empty()) return false;
      continue;
    }
    if (i + 1 >= argc || !ParseNumber(argv[i + 1], value)) return false;
    ++i;
    if (arg == "--runs") {
      o.runs = static_cast<int64_t>(value);
    } else if (arg == "--seed") {
      o.seed = value;
    } else if (arg == "--rss-bound-mib") {
      o.rssBoundMiB = value;
    } else {
      return false;
    }
  }
  if (const char* runs = std::getenv("FRINGE_SOAK_RUNS"); runs != nullptr && *runs != '\0') {
    uint64_t value = 0;
    if (!ParseNumber(runs, value) || value == 0) return false;
    o.runs = static_cast<int64_t>(value);
  }
  return o.runs > 0;
}

bool Sanitized() {
#if defined(__SANITIZE_ADDRESS__)
  return true;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
  return true;
#else
  return false;
#endif
#else
  return false;
#endif
}

double MiB(uint64_t bytes) {
  return static_cast<double>(bytes) / (1024.0 * 1024.0);
}

int Replay(Standin::Module& module, const std::vector<uint64_t>& seeds) {
  Soak::Tally tally;
  int status = 0;
  for (uint64_t seed : seeds) {
    const Soak::RunOutcome outcome = Soak::SoakRun(module, seed, tally);
    std::printf("seed %llu: %s\n%s", static_cast<unsigned long long>(seed), outcome.what.c_str(),
                outcome.failure.empty() ? "  ok\n" : outcome.failure.c_str());
    if (!outcome.failure.empty()) status = 1;
  }
  const std::string closing = Soak::EndRunInProgress(module);
  if (!closing.empty()) {
    std::printf("%s", closing.c_str());
    status = 1;
  }
  return status;
}

}  // namespace

int main(int argc, char** argv) {
  Options o;
  if (!Parse(argc, argv, o)) {
    std::fprintf(stderr,
                 "usage: fringe-soak [--runs N] [--seed S] [--rss-bound-mib M] "
                 "[--replay SEED ...]\n(FRINGE_SOAK_RUNS=N overrides --runs)\n");
    return 64;
  }
  // Alerts of failing runs go nowhere rather than to a window or the terminal.
#ifdef _WIN32
  SetVariable("FRINGE_ALERT_LOG", "NUL");
#else
  SetVariable("FRINGE_ALERT_LOG", "/dev/null");
#endif
  std::unique_ptr<Standin::Module> module = Standin::Module::Load(ModulePath(), true);
  if (!o.replay.empty()) return Replay(*module, o.replay);

  // Resident memory is read at the start, after a warm-up (allocator pools,
  // the module's first-use state) and at the end; only growth after the
  // warm-up counts.
  const int64_t warmUp = std::max<int64_t>(50, o.runs / 10);
  const uint64_t rssStart = Soak::ResidentBytes();
  uint64_t rssWarm = rssStart;
  const auto began = std::chrono::steady_clock::now();
  Soak::Tally tally;
  uint64_t previous = 0;
  for (int64_t i = 0; i < o.runs; ++i) {
    const uint64_t seed = Soak::RunSeed(o.seed, i);
    const Soak::RunOutcome outcome = Soak::SoakRun(*module, seed, tally);
    if (!outcome.failure.empty()) {
      // Only the run before can have left the module anything (an object kept
      // after a failing continue), so the two seeds replay it.
      std::fprintf(
          stderr, "run %lld failed (seed %llu): %s\n%sreplay: fringe-soak --replay %llu %llu\n",
          static_cast<long long>(i), static_cast<unsigned long long>(seed), outcome.what.c_str(),
          outcome.failure.c_str(), static_cast<unsigned long long>(previous),
          static_cast<unsigned long long>(seed));
      return 1;
    }
    previous = seed;
    if (i + 1 == warmUp) rssWarm = Soak::ResidentBytes();
  }
  const std::string closing = Soak::EndRunInProgress(*module);
  const double seconds =
      std::chrono::duration<double>(std::chrono::steady_clock::now() - began).count();
  const uint64_t rssEnd = Soak::ResidentBytes();

  std::printf("runs %lld in %.1f s (seed %llu)\n", static_cast<long long>(tally.runs), seconds,
              static_cast<unsigned long long>(o.seed));
  std::printf(
      "  with host faults %lld, some selector failed %lld, photo found %lld,\n"
      "  object kept after a failing continue %lld, host handles made %lld,\n"
      "  leaks excused by a fault that blocks giving back %lld\n",
      static_cast<long long>(tally.faulted), static_cast<long long>(tally.failedRuns),
      static_cast<long long>(tally.photos), static_cast<long long>(tally.survivors),
      static_cast<long long>(tally.handlesMade), static_cast<long long>(tally.excusedLeaks));
  std::printf("resident memory: start %.1f MiB, after %lld runs %.1f MiB, end %.1f MiB\n",
              MiB(rssStart), static_cast<long long>(warmUp), MiB(rssWarm), MiB(rssEnd));
  if (!closing.empty()) {
    std::fprintf(stderr, "%s", closing.c_str());
    return 1;
  }
  if (Sanitized()) {
    std::printf("resident memory not judged: the address sanitizer keeps freed memory\n");
    return 0;
  }
  if (rssWarm == 0 || rssEnd == 0) {
    std::fprintf(stderr, "resident memory could not be read\n");
    return 1;
  }
  const uint64_t bound = o.rssBoundMiB * 1024 * 1024;
  if (rssEnd > rssWarm + bound) {
    std::fprintf(stderr, "resident memory grew by %.1f MiB after the warm-up (bound %llu MiB)\n",
                 MiB(rssEnd - rssWarm), static_cast<unsigned long long>(o.rssBoundMiB));
    return 1;
  }
  return 0;
}
