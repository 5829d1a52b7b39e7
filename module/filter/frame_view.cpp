// Copying the frame's description out of the host's record.
#include "filter/frame_view.h"

namespace Project {
namespace {

Rect ToRect(const Vireo::HostRect& host) {
  return {host.top, host.left, host.bottom, host.right};
}

}  // namespace

FrameView FrameViewFromRecord(const Vireo::FilterRecord& record) {
  FrameView frame;
  frame.imageMode = record.imageMode;
  frame.filterCase = record.filterCase;
  frame.planes = record.planes;
  frame.documentRows = record.documentSize.v;
  frame.documentColumns = record.documentSize.h;
  frame.inRect = ToRect(record.inRect);
  frame.inData = static_cast<uint8_t*>(record.inData);
  frame.inRowBytes = record.inRowBytes;
  frame.inColumnBytes = record.inColumnBytes;
  frame.outRect = ToRect(record.outRect);
  frame.outData = static_cast<const uint8_t*>(record.outData);
  frame.outRowBytes = record.outRowBytes;
  frame.outColumnBytes = record.outColumnBytes;
  return frame;
}

}  // namespace Project
