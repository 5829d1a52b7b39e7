// PlaneScanner.
#include "filter/analysis/plane_scan.h"

#include <algorithm>

#include "filter/analysis/kernel_choice.h"

namespace Project {
namespace {

// Pixels ruled out together: wide chunks first, then the narrow ones of a
// wide chunk that holds a dark byte.
constexpr int32_t kWideChunk = 512;
constexpr int32_t kChunk = 32;

FRINGE_KERNEL_BODY uint8_t SmallestByteBody(const uint8_t* bytes, std::ptrdiff_t count) {
  uint8_t smallest = 255;
  for (std::ptrdiff_t i = 0; i < count; ++i) smallest = std::min(smallest, bytes[i]);
  return smallest;
}

uint8_t SmallestBytePortable(const uint8_t* bytes, std::ptrdiff_t count) {
  return SmallestByteBody(bytes, count);
}
#if FRINGE_WIDE_KERNELS
FRINGE_WIDE_TARGET uint8_t SmallestByteWide(const uint8_t* bytes, std::ptrdiff_t count) {
  return SmallestByteBody(bytes, count);
}
#endif

uint8_t SmallestByte(const uint8_t* bytes, std::ptrdiff_t count) {
#if FRINGE_WIDE_KERNELS
  if (UseWideKernels()) return SmallestByteWide(bytes, count);
#endif
  return SmallestBytePortable(bytes, count);
}

}  // namespace

bool PlaneScanner::MayHoldEdge(const uint8_t* first, int32_t a, int32_t b) const {
  // Only runs laid out forward can be summed up as one span of bytes.
  if (step_ < 1) return true;
  return SmallestByte(At(first, a), static_cast<std::ptrdiff_t>(b - 1 - a) * step_ + 1) <=
         kEdgeLimit;
}

int32_t PlaneScanner::First(const uint8_t* first, int32_t count) const {
  for (int32_t a = 0; a < count; a += kWideChunk) {
    const int32_t b = std::min(count, a + kWideChunk);
    if (!MayHoldEdge(first, a, b)) continue;
    for (int32_t c = a; c < b; c += kChunk) {
      const int32_t d = std::min(b, c + kChunk);
      if (!MayHoldEdge(first, c, d)) continue;
      for (int32_t i = c; i < d; ++i) {
        if (IsEdge(At(first, i))) return i;
      }
    }
  }
  return -1;
}

int32_t PlaneScanner::Last(const uint8_t* first, int32_t count) const {
  for (int32_t b = count; b > 0; b -= kWideChunk) {
    const int32_t a = std::max(0, b - kWideChunk);
    if (!MayHoldEdge(first, a, b)) continue;
    for (int32_t d = b; d > a; d -= kChunk) {
      const int32_t c = std::max(a, d - kChunk);
      if (!MayHoldEdge(first, c, d)) continue;
      for (int32_t i = d - 1; i >= c; --i) {
        if (IsEdge(At(first, i))) return i;
      }
    }
  }
  return -1;
}

}  // namespace Project
