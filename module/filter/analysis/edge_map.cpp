// BuildEdgeMap. The source is addressed with the output buffer's base and row
// distance and the input buffer's column distance.
#include "filter/analysis/edge_map.h"

#include <algorithm>

#include "filter/analysis/channels.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"

namespace Project {
namespace {

int32_t Extent(int16_t low, int16_t high) {
  return static_cast<int32_t>(static_cast<int16_t>(high - low));
}

// The channel sum of one source pixel.
inline int32_t ChannelSum(const uint8_t* pixel, int16_t channels) {
  int32_t sum = 0;
  for (int16_t k = 0; k < channels; ++k) sum += pixel[k];
  return sum;
}

// One map row y: a window of three source columns slides along the row, each
// new column adding its top, middle and bottom channel sums.
void MapRow(const FrameView& frame, int16_t channels, int32_t y, int32_t lastColumn,
            int32_t limit) {
  const int32_t step = frame.inColumnBytes;
  const uint8_t* above = PixelAt(frame.outData, 0, y - 1, frame.outRowBytes, step);
  const uint8_t* middle = PixelAt(frame.outData, 0, y, frame.outRowBytes, step);
  const uint8_t* below = PixelAt(frame.outData, 0, y + 1, frame.outRowBytes, step);
  uint8_t* target = PixelAt(frame.inData, 1, y, frame.inRowBytes, step);

  // Sums of columns x - 1 (left) and x (centre); column x + 1 is read per step.
  int32_t leftTop = ChannelSum(above, channels);
  int32_t leftMid = ChannelSum(middle, channels);
  int32_t leftBot = ChannelSum(below, channels);
  int32_t centreTop = ChannelSum(above + step, channels);
  int32_t centreBot = ChannelSum(below + step, channels);
  int32_t centreMid = ChannelSum(middle + step, channels);
  std::ptrdiff_t offset = 2 * static_cast<std::ptrdiff_t>(step);
  for (int32_t x = 1; x <= lastColumn; ++x) {
    const int32_t rightTop = ChannelSum(above + offset, channels);
    const int32_t rightMid = ChannelSum(middle + offset, channels);
    const int32_t rightBot = ChannelSum(below + offset, channels);
    const int32_t gx = (rightTop + 2 * rightMid + rightBot) - (leftTop + 2 * leftMid + leftBot);
    const int32_t gy = (leftBot + 2 * centreBot + rightBot) - (leftTop + 2 * centreTop + rightTop);
    *target = gx * gx + gy * gy > limit ? kEdge : kNoEdge;
    target += step;
    offset += step;
    leftTop = centreTop;
    leftMid = centreMid;
    leftBot = centreBot;
    centreTop = rightTop;
    centreMid = rightMid;
    centreBot = rightBot;
  }
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

  const int16_t channels = ChannelCount(frame.imageMode, 0);
  const int32_t limit = 9 * threshold * threshold;
  for (int32_t y = 1; y <= usableHeight - 4; ++y) {
    if (CancelRequested(host)) return;
    TakeProgressStep(progress, host);
    MapRow(frame, channels, y, usableWidth - 6, limit);
  }
}

}  // namespace Project
