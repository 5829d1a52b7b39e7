// CheckFrame: channel count, buffers, rectangles, distances, planes, overlap.
#include "filter/analysis/frame_check.h"

#include <cstdint>
#include <cstdlib>

#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"

namespace Project {
namespace {

constexpr int32_t kLargestSide = 32767;

// The address range a buffer of `rows` rows spans, end exclusive.
struct Span {
  uintptr_t begin;
  uintptr_t end;
};

Span BufferSpan(const uint8_t* base, int32_t rowBytes, int32_t columnBytes, int32_t columns,
                int32_t rows, int32_t pixelBytes) {
  const auto start = reinterpret_cast<uintptr_t>(base);
  const int64_t rowReach = static_cast<int64_t>(rows - 1) * rowBytes;
  const int64_t lineReach = static_cast<int64_t>(columns - 1) * columnBytes + pixelBytes;
  const int64_t low = rowReach < 0 ? rowReach : 0;
  const int64_t high = (rowReach > 0 ? rowReach : 0) + lineReach;
  return {start + static_cast<uintptr_t>(low), start + static_cast<uintptr_t>(high)};
}

bool RowsTooShort(int32_t rowBytes, int32_t columnBytes, int32_t width) {
  return std::llabs(static_cast<int64_t>(rowBytes)) < static_cast<int64_t>(width) * columnBytes;
}

bool SameRect(const Rect& a, const Rect& b) {
  return a.top == b.top && a.left == b.left && a.bottom == b.bottom && a.right == b.right;
}

}  // namespace

FrameProblem CheckFrame(const FrameView& frame) {
  const int16_t channels = ChannelCount(frame.imageMode, 0);
  if (channels <= 0) return FrameProblem::kNoChannels;
  if (frame.inData == nullptr) return FrameProblem::kNoInputBuffer;
  if (frame.outData == nullptr) return FrameProblem::kNoOutputBuffer;

  const int32_t width = int32_t{frame.inRect.right} - frame.inRect.left;
  const int32_t height = int32_t{frame.inRect.bottom} - frame.inRect.top;
  if (width <= 0 || height <= 0) return FrameProblem::kEmptyRectangle;
  if (width > kLargestSide || height > kLargestSide) return FrameProblem::kOversizedRectangle;

  const int32_t pixelBytes = channels + (HasTransparency(frame) ? 1 : 0);
  if (RowsTooShort(frame.inRowBytes, frame.inColumnBytes, width)) {
    return FrameProblem::kShortInputRows;
  }
  if (frame.inColumnBytes < pixelBytes) return FrameProblem::kNarrowInputPixels;
  if (frame.planes < pixelBytes) return FrameProblem::kTooFewPlanes;
  if (frame.outColumnBytes != frame.inColumnBytes || !SameRect(frame.outRect, frame.inRect)) {
    return FrameProblem::kOutputLayoutDiffers;
  }
  if (RowsTooShort(frame.outRowBytes, frame.outColumnBytes, width)) {
    return FrameProblem::kShortOutputRows;
  }

  const Span in =
      BufferSpan(frame.inData, frame.inRowBytes, frame.inColumnBytes, width, height, pixelBytes);
  const Span out =
      BufferSpan(frame.outData, frame.outRowBytes, frame.outColumnBytes, width, height, pixelBytes);
  if (in.begin < out.end && out.begin < in.end) return FrameProblem::kBuffersOverlap;
  return FrameProblem::kNone;
}

const char* DescribeFrameProblem(FrameProblem problem) {
  switch (problem) {
    case FrameProblem::kNone:
      return "usable frame";
    case FrameProblem::kNoChannels:
      return "the image mode has no channel count";
    case FrameProblem::kNoInputBuffer:
      return "the host delivered no input buffer";
    case FrameProblem::kNoOutputBuffer:
      return "the host delivered no output buffer";
    case FrameProblem::kEmptyRectangle:
      return "the input rectangle is empty or reversed";
    case FrameProblem::kOversizedRectangle:
      return "a side of the input rectangle exceeds 32767 pixels";
    case FrameProblem::kShortInputRows:
      return "the input row distance is shorter than a row of pixels";
    case FrameProblem::kNarrowInputPixels:
      return "the input column distance is smaller than a pixel";
    case FrameProblem::kTooFewPlanes:
      return "the host delivered fewer planes than the pixels need";
    case FrameProblem::kOutputLayoutDiffers:
      return "the output rectangle or column distance differs from the input's";
    case FrameProblem::kShortOutputRows:
      return "the output row distance is shorter than a row of pixels";
    case FrameProblem::kBuffersOverlap:
      return "the input and output buffers overlap";
  }
  return "unknown frame problem";
}

}  // namespace Project
