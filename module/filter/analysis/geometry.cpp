// SetPoint, ClipRect, FullImageCorners and OffsetCorners.
#include "filter/analysis/geometry.h"

#include <algorithm>

namespace Project {

void SetPoint(Point& point, int16_t h, int16_t v) {
  point.h = h;
  point.v = v;
}

void ClipRect(Rect& r, const Rect& c) {
  r.right = std::min(r.right, c.right);
  r.bottom = std::min(r.bottom, c.bottom);
  r.left = std::max(r.left, c.left);
  r.top = std::max(r.top, c.top);
}

void FullImageCorners(CornerQuad& quad, const Rect& image) {
  const auto lastColumn = static_cast<int16_t>(image.right - 1);
  const auto lastRow = static_cast<int16_t>(image.bottom - 1);
  SetPoint(quad.corner[0], 0, 0);
  SetPoint(quad.corner[1], lastColumn, 0);
  SetPoint(quad.corner[2], lastColumn, lastRow);
  SetPoint(quad.corner[3], 0, lastRow);
}

void OffsetCorners(CornerQuad& quad, int16_t dh, int16_t dv) {
  for (Point& p : quad.corner) {
    p.h = static_cast<int16_t>(p.h + dh);
    p.v = static_cast<int16_t>(p.v + dv);
  }
}

}  // namespace Project
