// Where a pixel of a host buffer lies: base + y x row distance + x x column
// distance, with signed distances so that bottom-up buffers work.
#pragma once

#include <cstddef>
#include <cstdint>

namespace Project {

// The products are formed in 64 bits: for every buffer smaller than 2 GiB
// this is the same as a 32-bit product sign-extended, and a larger buffer is
// addressed correctly instead of wrapping into memory the host never gave.
inline std::ptrdiff_t PixelOffset(int32_t x, int32_t y, int32_t rowBytes, int32_t columnBytes) {
  return static_cast<std::ptrdiff_t>(y) * rowBytes + static_cast<std::ptrdiff_t>(x) * columnBytes;
}

template <typename Byte>
Byte* PixelAt(Byte* base, int32_t x, int32_t y, int32_t rowBytes, int32_t columnBytes) {
  return base + PixelOffset(x, y, rowBytes, columnBytes);
}

}  // namespace Project
