// Gray profiles across one side of an outline: for each of a set of positions
// along the side, the values along the outward normal at a fixed step.
#pragma once

#include <cmath>
#include <span>
#include <vector>

#include "refine/page_image.h"
#include "refine/side_frame.h"

namespace Refine {

struct ProfileStrip {
  int lines = 0;       // positions along the side
  int width = 0;       // values per line
  double sFrom = 0.0;  // offset of value 0 across the side
  double sStep = 1.0;
  std::vector<double> t;      // position of each line along the side
  std::vector<float> values;  // lines x width; NaN where the area ends

  double At(int line, int k) const {
    return static_cast<double>(
        values[static_cast<size_t>(line) * static_cast<size_t>(width) + static_cast<size_t>(k)]);
  }
  double OffsetOf(int k) const { return sFrom + sStep * k; }
};

// Samples the strip. smear lines at a pixel's spacing along the side are
// averaged into each value (1: none) to calm noise without blurring the edge.
ProfileStrip SampleStrip(const GraySampler& sampler, const SampleArea& area, const SideFrame& frame,
                         std::span<const double> t, double sFrom, double sStep, int width,
                         int smear = 1);

// Evenly spread positions along [from, to], at most count of them.
std::vector<double> SpreadPositions(double from, double to, int count);

}  // namespace Refine
