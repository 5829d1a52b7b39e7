// Small records owned by one analysis run: the progress pair, the parameter
// block, and the double-precision points of the box fit.
#pragma once

#include <array>
#include <cstdint>

namespace Project {

// One progress step: done + 1, then the host's progress call with (done, total).
struct ProgressCounter {
  int32_t total = 0;
  int32_t done = 0;
};

// Filled by the driver before any stage runs, never changed afterwards.
struct AnalysisParams {
  int32_t minCount = 0;             // trunc(0.15 x min(W, H)), for the box fit
  int32_t edgeThreshold = 60;       // Sobel threshold of the edge map
  int32_t minSeparation = 10;       // cells between two count edges of the box fit
  double flatnessThreshold = 10.0;  // below this spread a page is flat
};

// A point of the box fit: x, then y.
struct PointD {
  double x = 0.0;
  double y = 0.0;
};

// c0 top-left, c1 top-right, c2 bottom-right, c3 bottom-left.
using BoxCorners = std::array<PointD, 4>;

}  // namespace Project
