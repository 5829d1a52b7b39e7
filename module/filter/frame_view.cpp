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
  // A host that leaves the output column distance at 0 does not report it: the
  // output is then read with the input's, as the host lays both out alike.
  frame.outColumnBytes = record.outColumnBytes != 0 ? record.outColumnBytes : record.inColumnBytes;
  return frame;
}

}  // namespace Project
