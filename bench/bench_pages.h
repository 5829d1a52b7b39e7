// The pages the benchmarks run on, each generated once, with frames over
// them laid out as a host delivers them.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "filter/analysis/double_list.h"
#include "filter/analysis/frame.h"
#include "synth/page_generator.h"

namespace Bench {

struct BenchPage {
  std::string name;
  Synth::Page page;
  std::vector<uint8_t> input;   // scratch: the edge map is written here
  std::vector<uint8_t> output;  // the frame as delivered, never written
  Project::FrameView view;
  // Edge points as the edge search leaves them on this page.
  Project::DoubleList xs;
  Project::DoubleList ys;

  double Megapixels() const { return page.width * 1e-6 * page.height; }
  // Puts the delivered pixels back into the input buffer.
  void RestoreInput();
};

// 2000 x 1500 RGB and 2550 x 3500 grayscale, each with a turned photo.
std::vector<std::unique_ptr<BenchPage>>& Pages();

}  // namespace Bench
