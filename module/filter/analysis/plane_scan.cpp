// PlaneScanner.
#include "filter/analysis/plane_scan.h"

#include <algorithm>

namespace Project {
namespace {

constexpr int32_t kChunk = 64;  // pixels ruled out together

uint8_t SmallestByte(const uint8_t* bytes, std::ptrdiff_t count) {
  uint8_t smallest = 255;
  for (std::ptrdiff_t i = 0; i < count; ++i) smallest = std::min(smallest, bytes[i]);
  return smallest;
}

}  // namespace

bool PlaneScanner::MayHoldEdge(const uint8_t* first, int32_t a, int32_t b) const {
  // Only runs laid out forward can be summed up as one span of bytes.
  if (step_ < 1) return true;
  return SmallestByte(At(first, a), static_cast<std::ptrdiff_t>(b - 1 - a) * step_ + 1) <=
         kEdgeLimit;
}

int32_t PlaneScanner::First(const uint8_t* first, int32_t count) const {
  for (int32_t a = 0; a < count; a += kChunk) {
    const int32_t b = std::min(count, a + kChunk);
    if (!MayHoldEdge(first, a, b)) continue;
    for (int32_t i = a; i < b; ++i) {
      if (IsEdge(At(first, i))) return i;
    }
  }
  return -1;
}

int32_t PlaneScanner::Last(const uint8_t* first, int32_t count) const {
  for (int32_t b = count; b > 0; b -= kChunk) {
    const int32_t a = std::max(0, b - kChunk);
    if (!MayHoldEdge(first, a, b)) continue;
    for (int32_t i = b - 1; i >= a; --i) {
      if (IsEdge(At(first, i))) return i;
    }
  }
  return -1;
}

}  // namespace Project
