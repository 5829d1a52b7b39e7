// A byte shuffle for pixels of three bytes that plain loops do not turn
// into good vector code, written with the processor's shuffle instructions.
// Only code that has checked ProcessorHasAvx2() may call it.
#pragma once

#include <cstdint>

namespace Vireo::Platform {

// Writes map[x] into the first byte of pixel x of `pixels` (three bytes a
// pixel, packed) for x in 0 ... count - 1; the pixels' other bytes keep
// their values. Reads map[0 ... count - 1] and pixels[0 ... 3 count - 1] only.
void SpreadIntoThreeBytePixelsAvx2(const uint8_t* map, uint8_t* pixels, int32_t count);

}  // namespace Vireo::Platform
