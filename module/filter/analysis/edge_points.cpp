// FindEdgePoints: one byte pointer per line, stepped by the row or column
// distance.
#include "filter/analysis/edge_points.h"

#include <cstddef>
#include <cstdint>

#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"

namespace Project {
namespace {

constexpr uint8_t kEdgeLimit = 50;    // map byte at most this: an edge
constexpr uint8_t kOpaqueLimit = 10;  // transparency byte at least this: counts

// Keeps a coordinate at least one pixel inside the frame: 1 ... extent - 2.
int16_t ClampInside(int16_t value, int16_t extent) {
  if (value < 1) value = 1;
  if (value >= extent - 1) value = static_cast<int16_t>(extent - 2);
  return value;
}

struct LineScanner {
  const uint8_t* base;
  int32_t rowBytes;
  int32_t columnBytes;
  std::ptrdiff_t alphaOffset;  // negative when transparency is ignored

  bool IsEdge(const uint8_t* pixel) const {
    return pixel[0] <= kEdgeLimit && (alphaOffset < 0 || pixel[alphaOffset] >= kOpaqueLimit);
  }

  // Tests `count` pixels from (x, y) onward, stepping by (dx, dy); answers
  // the index of the first edge pixel or -1.
  int32_t FirstEdge(int32_t x, int32_t y, int32_t dx, int32_t dy, int32_t count) const {
    const uint8_t* pixel = PixelAt(base, x, y, rowBytes, columnBytes);
    const std::ptrdiff_t step = PixelOffset(dx, dy, rowBytes, columnBytes);
    for (int32_t i = 0; i < count; ++i) {
      if (IsEdge(pixel)) return i;
      pixel += step;
    }
    return -1;
  }
};

struct PointSink {
  DoubleList& xs;
  DoubleList& ys;
  int32_t count = 0;

  void Add(int32_t x, int32_t y) {
    xs.data[count] = static_cast<double>(x);
    ys.data[count] = static_cast<double>(y);
    ++count;
  }
};

bool Fail(DoubleList& xs, DoubleList& ys) {
  FreeList(xs);
  FreeList(ys);
  return false;
}

}  // namespace

bool FindEdgePoints(const FrameView& frame, AnalysisHost& host, Rect search, DoubleList& xs,
                    DoubleList& ys, ProgressCounter& progress) {
  const int16_t width = FrameWidth(frame);
  const int16_t height = FrameHeight(frame);
  const int32_t left = ClampInside(search.left, width);
  const int32_t right = ClampInside(search.right, width);
  const int32_t top = ClampInside(search.top, height);
  const int32_t bottom = ClampInside(search.bottom, height);
  if (left >= right - 1 || top >= bottom - 1) return Fail(xs, ys);

  const int32_t capacity = 2 * ((right - left + 1) + (bottom - top + 1));
  if (!AllocList(xs, capacity) || !AllocList(ys, capacity)) return Fail(xs, ys);

  const int16_t channels = ChannelCount(frame.imageMode, 0);
  const LineScanner scan{frame.inData, frame.inRowBytes, frame.inColumnBytes,
                         HasTransparency(frame) ? channels : -1};
  PointSink sink{xs, ys};
  const int32_t across = right - left;  // pixels tested per row
  const int32_t down = bottom - top;    // pixels tested per column

  for (int32_t y = top; y <= bottom; ++y) {  // from the left
    if (CancelRequested(host)) return Fail(xs, ys);
    TakeProgressStep(progress, host);
    const int32_t i = scan.FirstEdge(left, y, 1, 0, across);
    if (i >= 0) sink.Add(left + i, y);
  }
  for (int32_t y = top; y <= bottom; ++y) {  // from the right
    if (CancelRequested(host)) return Fail(xs, ys);
    TakeProgressStep(progress, host);
    const int32_t i = scan.FirstEdge(right, y, -1, 0, across);
    if (i >= 0) sink.Add(right - i, y);
  }
  for (int32_t x = left; x <= right; ++x) {  // from the top
    if (CancelRequested(host)) return Fail(xs, ys);
    TakeProgressStep(progress, host);
    const int32_t i = scan.FirstEdge(x, top, 0, 1, down);
    if (i >= 0) sink.Add(x, top + i);
  }
  for (int32_t x = left; x <= right; ++x) {  // from the bottom
    if (CancelRequested(host)) return Fail(xs, ys);
    TakeProgressStep(progress, host);
    const int32_t i = scan.FirstEdge(x, bottom, 0, -1, down);
    if (i >= 0) sink.Add(x, bottom - i);
  }

  if (sink.count == 0) return Fail(xs, ys);
  xs.count = sink.count;
  ys.count = sink.count;
  return true;
}

}  // namespace Project
