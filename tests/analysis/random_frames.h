// Randomised frames for holding the module's stages against the literal ones:
// every layout a host may deliver (padded rows and pixels, bottom-up rows,
// extra planes), every image mode and filter case, and contents from real
// pages to hostile byte patterns. Each case follows from one 64-bit seed, so
// a failing case can be replayed alone.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "test_frame.h"

namespace AnalysisTest {

// A small deterministic generator (SplitMix64): the same seed gives the same
// numbers with every compiler and standard library.
class Random {
 public:
  explicit Random(uint64_t seed) : state_(seed) {}
  uint64_t Next();
  // A whole number in lo ... hi inclusive.
  int32_t Between(int32_t lo, int32_t hi);
  // True with probability percent / 100.
  bool Chance(int32_t percent);
  double Unit();  // in [0, 1)

 private:
  uint64_t state_;
};

enum class Content : int32_t {
  kPage,        // a synthetic scanned page with a turned photo
  kNoise,       // every byte random
  kBlocks,      // random rectangles on a random ground
  kExtremes,    // 0 and 255 in stripes, checks or solid
  kNearLimits,  // bytes and steps around the edge and transparency limits
};

struct FrameCase {
  uint64_t seed = 0;
  int32_t width = 0;
  int32_t height = 0;
  uint16_t imageMode = 1;
  int32_t colorPlanes = 1;  // planes holding colour (at least 1)
  bool alpha = false;       // a transparency plane behind them
  int16_t filterCase = 1;
  Layout layout;
  Content content = Content::kPage;
  bool outputDiffers = false;  // a few output bytes differ from the input's

  std::string Describe() const;
};

// The case a seed stands for. `largest` bounds the frame's sides.
FrameCase DrawFrameCase(uint64_t seed, int32_t largest = 160);

// A frame laid out and filled as the case says (the same bytes every time).
std::unique_ptr<TestFrame> BuildFrame(const FrameCase& c);

// The seed of case `index` of a named test group, or the replay seed from
// FRINGE_EQUALITY_SEED when that is set.
uint64_t CaseSeed(const char* group, int32_t index);
// How many cases each group runs: FRINGE_EQUALITY_CASES, 1 when replaying,
// else `usual`.
int32_t CaseCount(int32_t usual);

}  // namespace AnalysisTest
