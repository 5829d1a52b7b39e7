// The edge map's row kernels. The Sobel filter is separable: with P(x) the
// channel sum of pixel x, gx = [1 2 1]^T (P(x+1) - P(x-1)) and gy = [-1 0 1]^T
// (P(x-1) + 2 P(x) + P(x+1)). Each source row's horizontal difference and
// smoothing are made once, in 16-bit lanes, one lane per pixel, and kept for
// the three map rows that use them; a map row then takes a few additions per
// pixel. Integer sums, so every grouping gives the defined values; with at
// most four channels every intermediate fits 16 bits and gx^2 + gy^2 fits 32.
#pragma once

#include <cstdint>

namespace Project {

inline constexpr int16_t kMaxEdgeRowChannels = 4;

// The terms of one source row, for pixels 1 ... count - 2: difference[x] =
// P(x+1) - P(x-1) and smooth[x] = P(x-1) + 2 P(x) + P(x+1).
struct EdgeTermsJob {
  const uint8_t* row;  // pixel 0's first byte
  int32_t step;        // bytes from one pixel to the next, at least 1
  int16_t channels;    // 1 ... kMaxEdgeRowChannels
  int32_t count;       // pixels summed: 0 ... count - 1
  int16_t* sums;       // workspace of count entries
  int16_t* difference;
  int16_t* smooth;
};

// One map row, pixels first ... last (inside 1 ... count - 2 of the row
// below's job), from the terms of the source rows above (0) and at (1) it
// and of the row below, which are made on the way: 0 (an edge) where
// gx^2 + gy^2 > 9 threshold^2, else 255, into the first byte of each target
// pixel. The other bytes of the target pixels keep their values.
struct EdgeTestJob {
  const int16_t* difference[2];
  const int16_t* smooth;  // of the row above
  int32_t first;
  int32_t last;
  int32_t threshold;
  int32_t limit;    // 9 threshold^2
  uint8_t* target;  // pixel 0's first byte
  int32_t step;
  uint8_t* map;  // workspace of last + 1 entries, for a step above 1
};

void MakeEdgeTerms(const EdgeTermsJob& job);
void MapEdgeRow(const EdgeTermsJob& below, const EdgeTestJob& job);

}  // namespace Project
