// Sets of synthetic pages that both builds of the module can run identically:
// a fixed golden set and a seeded sweep, each page named by its recipe. Results
// go to a text file that the other platform's runner can compare with its own.
#pragma once

#include <cstdint>
#include <iosfwd>
#include <string>
#include <vector>

#include "standin/detect.h"
#include "synth/page_generator.h"

namespace Runner {

std::vector<Synth::PageRecipe> GoldenPages();
// `count` pages drawn from `seed` with integer arithmetic only, so that every
// platform draws the same pages.
std::vector<Synth::PageRecipe> SweepPages(int count, uint64_t seed);

// What one page gave, in the form compared across platforms.
struct PageResult {
  uint64_t pageHash = 0;  // of the generated pixels: tells generator from module differences
  std::array<int16_t, 6> selectors{};
  bool recordPresent = false;
  std::array<int16_t, 9> record{};
  bool descriptorPresent = false;
  uint64_t angleBits = 0;
  int32_t confidence = 0;
  std::array<int32_t, 8> points{};
  bool failed = false;  // the run reported an error
};

uint64_t HashPixels(const std::vector<uint8_t>& pixels);
PageResult ResultOf(const Synth::Page& page, const Standin::Detection& detection);

// One line per page; `header` names the set ("golden" or "sweep COUNT SEED").
void WriteResults(std::ostream& out, const std::string& header,
                  const std::vector<PageResult>& results);
// Throws Standin::Error for a file that is not a results file.
std::vector<PageResult> ReadResults(std::istream& in, std::string* header);
std::string Describe(const PageResult& result);
// The published values that differ ("record", "angle", ...), empty when equal.
std::vector<std::string> Differences(const PageResult& a, const PageResult& b);

}  // namespace Runner
