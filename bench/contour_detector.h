// A conventional photo finder of the kind a user would write with OpenCV:
// gray conversion, Otsu threshold, the largest outer contour and its
// minimum-area rectangle. Only for timing beside the analysis chain.
#pragma once

#include <array>
#include <cstdint>

namespace Bench {

struct ContourBox {
  std::array<float, 8> corners{};  // x, y of four corners
  float angle = 0.0F;
  bool found = false;
};

// The frame: `channels` interleaved 8-bit planes, rows `rowBytes` apart.
ContourBox DetectByContour(const uint8_t* pixels, int width, int height, int channels,
                           int rowBytes);

}  // namespace Bench
