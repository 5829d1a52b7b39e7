// The frame's width and height as the stages compute them: rectangle
// differences taken as signed 16-bit values.
#pragma once

#include <cstdint>

#include "filter/analysis/frame.h"

namespace Project {

inline int16_t FrameWidth(const FrameView& frame) {
  return static_cast<int16_t>(frame.inRect.right - frame.inRect.left);
}

inline int16_t FrameHeight(const FrameView& frame) {
  return static_cast<int16_t>(frame.inRect.bottom - frame.inRect.top);
}

// Filter cases 4 and 5 carry an editable transparency byte behind the colour.
inline bool HasTransparency(const FrameView& frame) {
  return frame.filterCase == 4 || frame.filterCase == 5;
}

}  // namespace Project
