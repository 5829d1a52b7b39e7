// The memory the filter claims at prepare for a frame of the given size.
#pragma once

#include <cstdint>

namespace Project {

// W + H + 2((PH + 1)W + W + 2H), that is 2PWH + 5W + 5H bytes, held at the
// largest positive 32-bit value for frames too large to say it in 32 bits and
// at 0 for sizes that describe no frame.
int32_t MemoryClaim(int32_t planes, int32_t width, int32_t height);

}  // namespace Project
