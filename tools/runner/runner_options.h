// The runner's command line.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>

#include "synth/page_generator.h"

namespace Runner {

enum class Mode { Single, Golden, Sweep, Compare, Help };

struct Options {
  Mode mode = Mode::Single;
  std::string module;  // empty: Fringe.9zf next to the runner
  bool privateCopy = false;

  // The document of a single run.
  int32_t width = 2000, height = 1500;
  int16_t imageMode = 3;
  bool alpha = false;
  std::optional<int16_t> planes;
  std::optional<std::array<int32_t, 4>> rect;
  std::optional<int16_t> filterCase;
  int32_t budget = 1 << 30;
  std::string rawFile;     // pixels from a file instead of a synthetic page
  Synth::PageRecipe page;  // photo, seed, noise, lid shadow (size and colour from above)
  int32_t cancelAt = 0;
  int continues = 1;
  int32_t rowPadding = 0;
  bool bottomUp = false;

  // The page sets.
  std::string resultsFile;  // written by golden and sweep, read by compare
  int sweepCount = 300;
  uint64_t sweepSeed = 1;
};

// Throws Standin::Error with a message for the user on a bad command line.
Options ParseOptions(int argc, char** argv);
const char* UsageText();

}  // namespace Runner
