// Finding the first or last edge pixel along a run of pixels. The run is
// taken in chunks: the smallest byte of a chunk's span (a plain loop the
// compiler turns into vector code) rules the whole chunk out when it is above
// the edge limit, since an edge pixel's map byte lies in that span; only a
// chunk that holds a dark byte is tested pixel by pixel.
#pragma once

#include <cstddef>
#include <cstdint>

namespace Project {

inline constexpr uint8_t kEdgeLimit = 50;    // map byte at most this: an edge
inline constexpr uint8_t kOpaqueLimit = 10;  // transparency byte at least this: counts

class PlaneScanner {
 public:
  // step: bytes from one pixel to the next; alphaOffset: where the
  // transparency byte lies in a pixel, or negative when it is ignored.
  PlaneScanner(int32_t step, int32_t alphaOffset) : step_(step), alphaOffset_(alphaOffset) {}

  bool IsEdge(const uint8_t* pixel) const {
    return pixel[0] <= kEdgeLimit && (alphaOffset_ < 0 || pixel[alphaOffset_] >= kOpaqueLimit);
  }

  // Index of the first (lowest) edge pixel among pixels 0 ... count - 1 from
  // `first`, or -1.
  int32_t First(const uint8_t* first, int32_t count) const;
  // Index of the last (highest) edge pixel among them, or -1.
  int32_t Last(const uint8_t* first, int32_t count) const;

 private:
  const uint8_t* At(const uint8_t* first, int32_t i) const {
    return first + static_cast<std::ptrdiff_t>(i) * step_;
  }
  // False when no pixel a ... b - 1 can be an edge: every byte from pixel a's
  // first byte to pixel b - 1's first byte is above the limit.
  bool MayHoldEdge(const uint8_t* first, int32_t a, int32_t b) const;

  int32_t step_;
  int32_t alphaOffset_;
};

}  // namespace Project
