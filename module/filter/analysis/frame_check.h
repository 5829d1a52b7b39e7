// What the driver can check of the host's frame before reading it: a broken
// or hostile host gets the failure record instead of reads outside the
// memory it gave.
#pragma once

#include "filter/analysis/frame.h"

namespace Project {

enum class FrameProblem {
  kNone,
  kNoChannels,  // an image mode without a channel count
  kNoInputBuffer,
  kNoOutputBuffer,
  kEmptyRectangle,      // input rectangle empty or reversed
  kOversizedRectangle,  // a side above 32767
  kShortInputRows,      // |row distance| below a row of pixels
  kNarrowInputPixels,   // column distance below the bytes of a pixel
  kTooFewPlanes,
  kOutputLayoutDiffers,  // output rectangle or column distance not the input's
  kShortOutputRows,
  kBuffersOverlap,  // the edge map would overwrite the document's pixels
};

// Checks every condition above in that order; kNone for a usable frame.
FrameProblem CheckFrame(const FrameView& frame);

// A short English description for logs and test messages.
const char* DescribeFrameProblem(FrameProblem problem);

}  // namespace Project
