// Colour channels per pixel by host image mode.
#pragma once

#include <cstdint>

namespace Project {

// Modes 0 to 11 from a fixed table; mode 7 and every mode above 11 give
// fallback. The stages ask with fallback 0.
int16_t ChannelCount(uint16_t imageMode, uint16_t fallback);

}  // namespace Project
