// The edge map: a thresholded Sobel gradient of the channel sum, read from
// the output buffer and written into plane 0 of the input buffer (0 for an
// edge, 255 for none).
#pragma once

#include <cstdint>

#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"

namespace Project {

inline constexpr uint8_t kEdge = 0;
inline constexpr uint8_t kNoEdge = 255;

// Computes rows 1 ... Hu - 4 and columns 1 ... Wu - 6 of the usable extent,
// one progress step per row; nothing for an extent that is too small. On a
// cancel the rows done so far keep their map values.
void BuildEdgeMap(const FrameView& frame, AnalysisHost& host, int32_t threshold,
                  ProgressCounter& progress);

}  // namespace Project
