// The edge point search, literally: every tested pixel addressed afresh.
#include <cstdint>

#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"
#include "filter/analysis/reference/literal_stages.h"

namespace Project::Reference {
namespace {

int16_t Clamp(int16_t value, int16_t extent) {
  if (value < 1) value = 1;
  if (value >= extent - 1) value = static_cast<int16_t>(extent - 2);
  return value;
}

bool IsEdge(const FrameView& frame, int16_t channels, int32_t x, int32_t y) {
  const uint8_t* pixel = PixelAt(frame.inData, x, y, frame.inRowBytes, frame.inColumnBytes);
  if (pixel[0] > 50) return false;
  return !HasTransparency(frame) || pixel[channels] >= 10;
}

bool Release(DoubleList& xs, DoubleList& ys) {
  FreeList(xs);
  FreeList(ys);
  return false;
}

}  // namespace

bool FindEdgePoints(const FrameView& frame, AnalysisHost& host, Rect search, DoubleList& xs,
                    DoubleList& ys, ProgressCounter& progress) {
  const int16_t width = FrameWidth(frame);
  const int16_t height = FrameHeight(frame);
  const int32_t left = Clamp(search.left, width);
  const int32_t right = Clamp(search.right, width);
  const int32_t top = Clamp(search.top, height);
  const int32_t bottom = Clamp(search.bottom, height);
  if (left >= right - 1 || top >= bottom - 1) return Release(xs, ys);
  const int32_t capacity = 2 * ((right - left + 1) + (bottom - top + 1));
  if (!AllocList(xs, capacity) || !AllocList(ys, capacity)) return Release(xs, ys);

  const int16_t c = ChannelCount(frame.imageMode, 0);
  int32_t count = 0;
  const auto add = [&](int32_t x, int32_t y) {
    xs.data[count] = x;
    ys.data[count] = y;
    ++count;
  };
  for (int32_t y = top; y <= bottom; ++y) {
    if (CancelRequested(host)) return Release(xs, ys);
    TakeProgressStep(progress, host);
    for (int32_t x = left; x <= right - 1; ++x) {
      if (IsEdge(frame, c, x, y)) {
        add(x, y);
        break;
      }
    }
  }
  for (int32_t y = top; y <= bottom; ++y) {
    if (CancelRequested(host)) return Release(xs, ys);
    TakeProgressStep(progress, host);
    for (int32_t x = right; x >= left + 1; --x) {
      if (IsEdge(frame, c, x, y)) {
        add(x, y);
        break;
      }
    }
  }
  for (int32_t x = left; x <= right; ++x) {
    if (CancelRequested(host)) return Release(xs, ys);
    TakeProgressStep(progress, host);
    for (int32_t y = top; y <= bottom - 1; ++y) {
      if (IsEdge(frame, c, x, y)) {
        add(x, y);
        break;
      }
    }
  }
  for (int32_t x = left; x <= right; ++x) {
    if (CancelRequested(host)) return Release(xs, ys);
    TakeProgressStep(progress, host);
    for (int32_t y = bottom; y >= top + 1; --y) {
      if (IsEdge(frame, c, x, y)) {
        add(x, y);
        break;
      }
    }
  }
  if (count == 0) return Release(xs, ys);
  xs.count = count;
  ys.count = count;
  return true;
}

}  // namespace Project::Reference
