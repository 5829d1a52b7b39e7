// BuildEdgeMap. The source is addressed with the output buffer's base and row
// distance and the input buffer's column distance.
//
// The Sobel filter is separable: gx = [1 2 1]^T (S(x+1) - S(x-1)) and
// gy = [-1 0 1]^T (S(x-1) + 2 S(x) + S(x+1)). Each source row's horizontal
// difference and smoothing are made once, in 16-bit lanes, and kept for the
// three map rows that use them; a map row then takes a few additions per
// position, in plain loops the compiler turns into vector code. The lanes
// follow the buffer's bytes, so a pixel's map byte lands in place; lanes
// between pixel starts are computed and thrown away. Integer sums, so every
// grouping gives the defined values; with at most four channels every
// intermediate fits 16 bits and gx^2 + gy^2 fits 32.
//
// When the two buffers overlap, or no workspace can be had, each row is
// computed with a three-column window sliding along it.
#include "filter/analysis/edge_map.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/channels.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"

namespace Project {
namespace {

constexpr int16_t kMaxLaneChannels = 4;
// Wider pixels would make the lanes mostly waste; they take the sliding road.
constexpr int32_t kMaxLaneStep = 8;

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

// The horizontal terms of one source row, in lanes 0 ... lanes - 1:
// difference[i] = P(i + step) - P(i - step) and smooth[i] = P(i - step) +
// 2 P(i) + P(i + step), where P(i) is the sum of the channel bytes from i on.
// Lanes below `step` and from lanes - step on are not written.
class RowTerms {
 public:
  bool Allocate(int32_t lanes) {
    const auto size = static_cast<std::size_t>(lanes);
    sums_ = AllocateWorkspace<int16_t>(size);
    for (auto& row : difference_) row = AllocateWorkspace<int16_t>(size);
    for (auto& row : smooth_) row = AllocateWorkspace<int16_t>(size);
    return sums_ && difference_[0] && difference_[1] && difference_[2] && smooth_[0] &&
           smooth_[1] && smooth_[2];
  }

  // Makes the terms of source row `row` from its bytes.
  void Make(int32_t row, const uint8_t* __restrict bytes, int32_t lanes, int32_t step,
            int16_t channels) {
    int16_t* __restrict d = Difference(row);
    int16_t* __restrict s = Smooth(row);
    if (channels == 1) {
      // One channel: the sums are the bytes themselves.
      for (int32_t i = step; i < lanes - step; ++i) {
        d[i] = static_cast<int16_t>(bytes[i + step] - bytes[i - step]);
        s[i] = static_cast<int16_t>(bytes[i - step] + 2 * bytes[i] + bytes[i + step]);
      }
      return;
    }
    int16_t* __restrict p = sums_.get();
    switch (channels) {
      case 2:
        for (int32_t i = 0; i < lanes; ++i) p[i] = static_cast<int16_t>(bytes[i] + bytes[i + 1]);
        break;
      case 3:
        for (int32_t i = 0; i < lanes; ++i) {
          p[i] = static_cast<int16_t>(bytes[i] + bytes[i + 1] + bytes[i + 2]);
        }
        break;
      default:
        for (int32_t i = 0; i < lanes; ++i) {
          p[i] = static_cast<int16_t>(bytes[i] + bytes[i + 1] + bytes[i + 2] + bytes[i + 3]);
        }
        break;
    }
    for (int32_t i = step; i < lanes - step; ++i) {
      d[i] = static_cast<int16_t>(p[i + step] - p[i - step]);
      s[i] = static_cast<int16_t>(p[i - step] + 2 * p[i] + p[i + step]);
    }
  }

  int16_t* Difference(int32_t row) { return difference_[row % 3].get(); }
  int16_t* Smooth(int32_t row) { return smooth_[row % 3].get(); }

 private:
  std::unique_ptr<int16_t[]> sums_;
  std::unique_ptr<int16_t[]> difference_[3];
  std::unique_ptr<int16_t[]> smooth_[3];
};

// The edge test for thresholds up to kSmallThreshold, in 16-bit lanes: with
// gx and gy clamped into -(3t + 1) ... 3t + 1 each square stays below 2^15 and a capped
// value alone already exceeds 9t^2, so the answer is unchanged; and
// gx^2 + gy^2 > 9t^2 is asked as gx^2 > 9t^2 - gy^2, both sides in 16 bits.
constexpr int32_t kSmallThreshold = 60;

struct SmallTest {
  int16_t cap;    // 3t + 1
  int16_t limit;  // 9t^2

  uint8_t operator()(int16_t gx, int16_t gy) const {
    // Clamped into -cap ... cap: the squares are those of the capped magnitudes.
    const auto ax = std::clamp<int16_t>(gx, static_cast<int16_t>(-cap), cap);
    const auto ay = std::clamp<int16_t>(gy, static_cast<int16_t>(-cap), cap);
    const auto squareX = static_cast<int16_t>(ax * ax);
    const auto rest = static_cast<int16_t>(limit - ay * ay);
    return squareX > rest ? kEdge : kNoEdge;
  }
};

// Asks for a row's bytes ahead of their use, so that fetching the next rows
// overlaps the work on this one. A hint only: it changes no result.
void PrefetchRow(const uint8_t* row, int32_t bytes, bool forWriting) {
  constexpr int32_t kCacheLine = 64;
  for (int32_t i = 0; i < bytes; i += kCacheLine) {
    if (forWriting) {
      __builtin_prefetch(row + i, 1);
    } else {
      __builtin_prefetch(row + i, 0);
    }
  }
}

struct WideTest {
  int32_t limit;

  uint8_t operator()(int16_t gx, int16_t gy) const {
    return int32_t{gx} * gx + int32_t{gy} * gy > limit ? kEdge : kNoEdge;
  }
};

// Map row y from the terms of rows y - 1, y and y + 1, lanes first ... last.
// keep marks the lanes that are not a pixel's first byte (null: none).
template <typename Test>
void LaneRow(RowTerms& terms, int32_t y, int32_t first, int32_t last, Test test,
             const uint8_t* __restrict keep, uint8_t* __restrict target) {
  const int16_t* __restrict d0 = terms.Difference(y - 1);
  const int16_t* __restrict d1 = terms.Difference(y);
  const int16_t* __restrict d2 = terms.Difference(y + 1);
  const int16_t* __restrict s0 = terms.Smooth(y - 1);
  const int16_t* __restrict s2 = terms.Smooth(y + 1);
  if (keep == nullptr) {
    for (int32_t i = first; i <= last; ++i) {
      const auto gx = static_cast<int16_t>(d0[i] + 2 * d1[i] + d2[i]);
      const auto gy = static_cast<int16_t>(s2[i] - s0[i]);
      target[i] = test(gx, gy);
    }
    return;
  }
  for (int32_t i = first; i <= last; ++i) {
    const auto gx = static_cast<int16_t>(d0[i] + 2 * d1[i] + d2[i]);
    const auto gy = static_cast<int16_t>(s2[i] - s0[i]);
    target[i] = static_cast<uint8_t>((test(gx, gy) & ~keep[i]) | (target[i] & keep[i]));
  }
}

// The whole map through separable row terms. False (before any host call)
// when the layout does not suit the lanes or no workspace can be had.
bool LaneMap(const FrameView& frame, AnalysisHost& host, const MapExtent& e,
             ProgressCounter& progress) {
  const int32_t step = frame.inColumnBytes;
  if (e.channels < 1 || e.channels > kMaxLaneChannels || step < 1 || step > kMaxLaneStep ||
      e.width - 6 < 1) {
    return false;
  }
  const Span in = RowsSpan(frame.inData, frame.inRowBytes, step, e.width, e.height, e.channels);
  const Span out = RowsSpan(frame.outData, frame.outRowBytes, step, e.width, e.height, e.channels);
  if (in.begin < out.end && out.begin < in.end) return false;

  // Lanes up to the first byte of column width - 5, the last the map reads.
  const int64_t lanes64 = static_cast<int64_t>(e.width - 5) * step + 1;
  const auto lanes = static_cast<int32_t>(lanes64);
  RowTerms terms;
  if (!terms.Allocate(lanes)) return false;
  std::unique_ptr<uint8_t[]> keep;
  if (step > 1) {
    keep = AllocateWorkspace<uint8_t>(static_cast<std::size_t>(lanes));
    if (!keep) return false;
    for (int32_t i = 0; i < lanes; ++i) keep[i] = i % step == 0 ? 0 : 0xFF;
  }

  const auto source = [&](int32_t row) {
    return PixelAt(frame.outData, 0, row, frame.outRowBytes, step);
  };
  const int32_t first = step;
  const int32_t last = (e.width - 6) * step;
  const bool small = e.threshold >= -kSmallThreshold && e.threshold <= kSmallThreshold;
  const auto cap = static_cast<int16_t>(3 * (e.threshold < 0 ? -e.threshold : e.threshold) + 1);
  terms.Make(0, source(0), lanes, step, e.channels);
  terms.Make(1, source(1), lanes, step, e.channels);
  for (int32_t y = 1; y <= e.height - 4; ++y) {
    if (CancelRequested(host)) return true;
    TakeProgressStep(progress, host);
    if (y + 2 <= e.height - 3) {
      PrefetchRow(source(y + 2), lanes, false);
      PrefetchRow(PixelAt(frame.inData, 0, y + 1, frame.inRowBytes, step), lanes, true);
    }
    terms.Make(y + 1, source(y + 1), lanes, step, e.channels);
    uint8_t* target = PixelAt(frame.inData, 0, y, frame.inRowBytes, step);
    if (small) {
      LaneRow(terms, y, first, last, SmallTest{cap, static_cast<int16_t>(e.limit)}, keep.get(),
              target);
    } else {
      LaneRow(terms, y, first, last, WideTest{e.limit}, keep.get(), target);
    }
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

  if (LaneMap(frame, host, e, progress)) return;
  for (int32_t y = 1; y <= e.height - 4; ++y) {
    if (CancelRequested(host)) return;
    TakeProgressStep(progress, host);
    SlidingRow(frame, e, y);
  }
}

}  // namespace Project
