// BuildEdgeMap. The source is addressed with the output buffer's base and row
// distance and the input buffer's column distance.
//
// The map is made row by row by the separable row kernels (edge_rows.h).
// When the two buffers overlap, the pixels hold too many channels, or no
// workspace can be had, each row is computed with a three-column window
// sliding along it.
#include "filter/analysis/edge_map.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/channels.h"
#include "filter/analysis/edge_rows.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"

namespace Project {
namespace {

int32_t Extent(int16_t low, int16_t high) {
  return static_cast<int32_t>(static_cast<int16_t>(high - low));
}

struct MapExtent {
  int32_t width;   // usable columns
  int32_t height;  // usable rows
  int16_t channels;
  int32_t threshold;
  int32_t limit;  // 9t^2
};

// The channel sum of one source pixel.
inline int32_t ChannelSum(const uint8_t* pixel, int16_t channels) {
  int32_t sum = 0;
  for (int16_t k = 0; k < channels; ++k) sum += pixel[k];
  return sum;
}

// One map row y: a window of three source columns slides along the row, each
// new column adding its top, middle and bottom channel sums.
void SlidingRow(const FrameView& frame, const MapExtent& e, int32_t y) {
  const int32_t step = frame.inColumnBytes;
  const int16_t channels = e.channels;
  const uint8_t* above = PixelAt(frame.outData, 0, y - 1, frame.outRowBytes, step);
  const uint8_t* middle = PixelAt(frame.outData, 0, y, frame.outRowBytes, step);
  const uint8_t* below = PixelAt(frame.outData, 0, y + 1, frame.outRowBytes, step);
  uint8_t* target = PixelAt(frame.inData, 1, y, frame.inRowBytes, step);

  int32_t leftTop = ChannelSum(above, channels);
  int32_t leftMid = ChannelSum(middle, channels);
  int32_t leftBot = ChannelSum(below, channels);
  int32_t centreTop = ChannelSum(above + step, channels);
  int32_t centreBot = ChannelSum(below + step, channels);
  int32_t centreMid = ChannelSum(middle + step, channels);
  std::ptrdiff_t offset = 2 * static_cast<std::ptrdiff_t>(step);
  for (int32_t x = 1; x <= e.width - 6; ++x) {
    const int32_t rightTop = ChannelSum(above + offset, channels);
    const int32_t rightMid = ChannelSum(middle + offset, channels);
    const int32_t rightBot = ChannelSum(below + offset, channels);
    const int32_t gx = (rightTop + 2 * rightMid + rightBot) - (leftTop + 2 * leftMid + leftBot);
    const int32_t gy = (leftBot + 2 * centreBot + rightBot) - (leftTop + 2 * centreTop + rightTop);
    *target = gx * gx + gy * gy > e.limit ? kEdge : kNoEdge;
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

// The bytes each buffer spans over the usable rows and columns, end exclusive.
struct Span {
  uintptr_t begin;
  uintptr_t end;
};

Span RowsSpan(const uint8_t* base, int32_t rowBytes, int32_t columnBytes, int32_t columns,
              int32_t rows, int16_t channels) {
  const auto start = reinterpret_cast<uintptr_t>(base);
  const int64_t rowReach = static_cast<int64_t>(rows - 1) * rowBytes;
  const int64_t lineReach = static_cast<int64_t>(columns - 1) * columnBytes + channels;
  const int64_t low = std::min<int64_t>(rowReach, 0);
  const int64_t high = std::max<int64_t>(rowReach, 0) + lineReach;
  return {start + static_cast<uintptr_t>(low), start + static_cast<uintptr_t>(high)};
}

// The terms of the last three source rows, by row number.
class RowTerms {
 public:
  bool Allocate(int32_t count) {
    const auto size = static_cast<std::size_t>(count);
    sums_ = AllocateWorkspace<int16_t>(size);
    map_ = AllocateWorkspace<uint8_t>(size);
    for (auto& row : difference_) row = AllocateWorkspace<int16_t>(size);
    for (auto& row : smooth_) row = AllocateWorkspace<int16_t>(size);
    return sums_ && map_ && difference_[0] && difference_[1] && difference_[2] && smooth_[0] &&
           smooth_[1] && smooth_[2];
  }

  // The job that makes the terms of source row `row` from its bytes.
  EdgeTermsJob Job(int32_t row, const uint8_t* bytes, int32_t step, int16_t channels,
                   int32_t count) {
    return {bytes, step, channels, count, sums_.get(), Difference(row), Smooth(row)};
  }

  int16_t* Difference(int32_t row) { return difference_[row % 3].get(); }
  int16_t* Smooth(int32_t row) { return smooth_[row % 3].get(); }
  uint8_t* Map() { return map_.get(); }

 private:
  std::unique_ptr<int16_t[]> sums_;
  std::unique_ptr<uint8_t[]> map_;
  std::unique_ptr<int16_t[]> difference_[3];
  std::unique_ptr<int16_t[]> smooth_[3];
};

// Asks for a source row two rows ahead of its use. Measured: it pays for
// one-byte pixels, whose rows take little work against their fetch; rows of
// wider pixels are left to the processor's own prefetching. A hint only.
void PrefetchRow(const uint8_t* row, int32_t bytes) {
  constexpr int32_t kCacheLine = 64;
  for (int32_t i = 0; i < bytes; i += kCacheLine) __builtin_prefetch(row + i);
}

// The whole map through separable row terms. False (before any host call)
// when the layout does not suit the row kernels or no workspace can be had.
bool RowKernelMap(const FrameView& frame, AnalysisHost& host, const MapExtent& e,
                  ProgressCounter& progress) {
  const int32_t step = frame.inColumnBytes;
  if (e.channels < 1 || e.channels > kMaxEdgeRowChannels || step < 1 || e.width - 6 < 1) {
    return false;
  }
  const Span in = RowsSpan(frame.inData, frame.inRowBytes, step, e.width, e.height, e.channels);
  const Span out = RowsSpan(frame.outData, frame.outRowBytes, step, e.width, e.height, e.channels);
  if (in.begin < out.end && out.begin < in.end) return false;

  // Pixels up to column width - 5, the last the map reads.
  const int32_t count = e.width - 4;
  RowTerms terms;
  if (!terms.Allocate(count)) return false;

  const auto source = [&](int32_t row) {
    return PixelAt(frame.outData, 0, row, frame.outRowBytes, step);
  };
  MakeEdgeTerms(terms.Job(0, source(0), step, e.channels, count));
  MakeEdgeTerms(terms.Job(1, source(1), step, e.channels, count));
  for (int32_t y = 1; y <= e.height - 4; ++y) {
    if (CancelRequested(host)) return true;
    TakeProgressStep(progress, host);
    if (step == 1 && y + 3 <= e.height - 3) PrefetchRow(source(y + 3), count);
    EdgeTestJob job{};
    job.difference[0] = terms.Difference(y - 1);
    job.difference[1] = terms.Difference(y);
    job.smooth = terms.Smooth(y - 1);
    job.first = 1;
    job.last = e.width - 6;
    job.threshold = e.threshold;
    job.limit = e.limit;
    job.target = PixelAt(frame.inData, 0, y, frame.inRowBytes, step);
    job.step = step;
    job.map = terms.Map();
    MapEdgeRow(terms.Job(y + 1, source(y + 1), step, e.channels, count), job);
  }
  return true;
}

}  // namespace

void BuildEdgeMap(const FrameView& frame, AnalysisHost& host, int32_t threshold,
                  ProgressCounter& progress) {
  const int32_t width = Extent(frame.inRect.left, frame.inRect.right);
  const int32_t height = Extent(frame.inRect.top, frame.inRect.bottom);
  const int32_t outWidth = Extent(frame.outRect.left, frame.outRect.right);
  const int32_t outHeight = Extent(frame.outRect.top, frame.outRect.bottom);
  if (width < 3 || height < 3 || outWidth < 3 || outHeight < 3) return;
  const MapExtent e{std::min(width, outWidth), std::min(height, outHeight),
                    ChannelCount(frame.imageMode, 0), threshold, 9 * threshold * threshold};
  if (e.height - 4 < 1) return;

  if (RowKernelMap(frame, host, e, progress)) return;
  for (int32_t y = 1; y <= e.height - 4; ++y) {
    if (CancelRequested(host)) return;
    TakeProgressStep(progress, host);
    SlidingRow(frame, e, y);
  }
}

}  // namespace Project
