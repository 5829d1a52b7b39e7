// Records shared by the analysis stages, the driver and the filter that
// publishes their result: points, rectangles, corner quads and the result.
#pragma once

#include <cstdint>

namespace Project {

// A pixel position: row (v) first, then column (h).
struct Point {
  int16_t v = 0;
  int16_t h = 0;
};

// Bottom and right lie one past the last row and column.
struct Rect {
  int16_t top = 0;
  int16_t left = 0;
  int16_t bottom = 0;
  int16_t right = 0;
};

// Clockwise from the top-left corner: top-left, top-right, bottom-right, bottom-left.
struct CornerQuad {
  Point corner[4];
};

// The last answer of the analysis. One instance per loaded module, zero at load,
// never reset between runs: a run that fails early leaves the previous answer.
struct AnalysisResult {
  CornerQuad corners;
  double angle = 0.0;      // degrees
  int16_t confidence = 0;  // 0, 127 or 255
};

}  // namespace Project
