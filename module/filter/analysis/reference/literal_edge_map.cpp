// The edge map, literally: every channel sum of the Sobel neighbourhood read
// afresh for every map position.
#include <algorithm>
#include <cstdint>

#include "filter/analysis/channels.h"
#include "filter/analysis/edge_map.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"
#include "filter/analysis/reference/literal_stages.h"

namespace Project::Reference {
namespace {

int32_t Extent(int16_t low, int16_t high) {
  return static_cast<int32_t>(static_cast<int16_t>(high - low));
}

// S(x, y): output buffer's base and row distance, input buffer's column distance.
int32_t S(const FrameView& frame, int16_t channels, int32_t x, int32_t y) {
  const uint8_t* pixel = PixelAt(frame.outData, x, y, frame.outRowBytes, frame.inColumnBytes);
  int32_t sum = 0;
  for (int16_t k = 0; k < channels; ++k) sum += pixel[k];
  return sum;
}

}  // namespace

void BuildEdgeMap(const FrameView& frame, AnalysisHost& host, int32_t threshold,
                  ProgressCounter& progress) {
  const int32_t width = Extent(frame.inRect.left, frame.inRect.right);
  const int32_t height = Extent(frame.inRect.top, frame.inRect.bottom);
  const int32_t outWidth = Extent(frame.outRect.left, frame.outRect.right);
  const int32_t outHeight = Extent(frame.outRect.top, frame.outRect.bottom);
  if (width < 3 || height < 3 || outWidth < 3 || outHeight < 3) return;
  const int32_t usableWidth = std::min(width, outWidth);
  const int32_t usableHeight = std::min(height, outHeight);
  if (usableHeight - 4 < 1) return;

  const int16_t c = ChannelCount(frame.imageMode, 0);
  const int32_t limit = 9 * threshold * threshold;
  for (int32_t y = 1; y <= usableHeight - 4; ++y) {
    if (CancelRequested(host)) return;
    TakeProgressStep(progress, host);
    for (int32_t x = 1; x <= usableWidth - 6; ++x) {
      const int32_t gx =
          (S(frame, c, x + 1, y - 1) + 2 * S(frame, c, x + 1, y) + S(frame, c, x + 1, y + 1)) -
          (S(frame, c, x - 1, y - 1) + 2 * S(frame, c, x - 1, y) + S(frame, c, x - 1, y + 1));
      const int32_t gy =
          (S(frame, c, x - 1, y + 1) + 2 * S(frame, c, x, y + 1) + S(frame, c, x + 1, y + 1)) -
          (S(frame, c, x - 1, y - 1) + 2 * S(frame, c, x, y - 1) + S(frame, c, x + 1, y - 1));
      uint8_t* target = PixelAt(frame.inData, x, y, frame.inRowBytes, frame.inColumnBytes);
      *target = gx * gx + gy * gy > limit ? kEdge : kNoEdge;
    }
  }
}

}  // namespace Project::Reference
