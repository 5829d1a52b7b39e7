// RoundCorners and SnapCorners.
#include "filter/analysis/corner_snap.h"

#include <cstdint>

#include "filter/analysis/geometry.h"
#include "filter/analysis/numeric.h"

namespace Project {
namespace {

constexpr int32_t kSnapReach = 12;

bool Near(int32_t distance) {
  return distance >= 1 && distance <= kSnapReach;
}

int16_t RoundToInt16(double value) {
  return static_cast<int16_t>(TruncToInt32(RoundHalfAway(value)));
}

}  // namespace

void RoundCorners(const BoxCorners& box, CornerQuad& quad) {
  for (int k = 0; k < 4; ++k) {
    SetPoint(quad.corner[k], RoundToInt16(box[k].x), RoundToInt16(box[k].y));
  }
}

void SnapCorners(CornerQuad& quad, const Rect& r) {
  Point& c1 = quad.corner[0];
  Point& c2 = quad.corner[1];
  Point& c3 = quad.corner[2];
  Point& c4 = quad.corner[3];
  if (Near(int32_t{c1.h} - r.left) && Near(int32_t{c4.h} - r.left)) {
    c1.h = r.left;
    c4.h = r.left;
  }
  if (Near(int32_t{c1.v} - r.top) && Near(int32_t{c2.v} - r.top)) {
    c1.v = r.top;
    c2.v = r.top;
  }
  if (Near(int32_t{r.right} - c2.h) && Near(int32_t{r.right} - c3.h)) {
    c2.h = static_cast<int16_t>(r.right - 1);
    c3.h = static_cast<int16_t>(r.right - 1);
  }
  if (Near(int32_t{r.bottom} - c3.v) && Near(int32_t{r.bottom} - c4.v)) {
    c3.v = static_cast<int16_t>(r.bottom - 1);
    c4.v = static_cast<int16_t>(r.bottom - 1);
  }
}

}  // namespace Project
