// The straightened frame of a detected photo.
#include "photo_geometry.h"

#include <algorithm>
#include <cmath>
#include <numbers>

namespace Fringe {

namespace {

double Distance(const Corner& a, const Corner& b) {
  return std::hypot(static_cast<double>(b.x) - a.x, static_cast<double>(b.y) - a.y);
}

}  // namespace

PhotoFrame FrameOfPhoto(const std::array<Corner, 4>& c, double angleDegrees, int margin) {
  PhotoFrame f;
  f.centreX = (static_cast<double>(c[0].x) + c[1].x + c[2].x + c[3].x) / 4.0;
  f.centreY = (static_cast<double>(c[0].y) + c[1].y + c[2].y + c[3].y) / 4.0;
  // Corners are pixel positions on the photo's outline, so a side spans one
  // pixel more than the distance between its corners.
  const double across = (Distance(c[0], c[1]) + Distance(c[3], c[2])) / 2.0 + 1.0;
  const double down = (Distance(c[0], c[3]) + Distance(c[1], c[2])) / 2.0 + 1.0;
  f.width = std::max(1, static_cast<int>(std::lround(across)) + 2 * margin);
  f.height = std::max(1, static_cast<int>(std::lround(down)) + 2 * margin);
  f.angleDegrees = angleDegrees;
  return f;
}

PagePoint PagePointOf(const PhotoFrame& f, double u, double v) {
  const double t = f.angleDegrees * std::numbers::pi / 180.0;
  const double cs = std::cos(t), sn = std::sin(t);
  const double du = u - (f.width - 1) / 2.0, dv = v - (f.height - 1) / 2.0;
  // The photo's rightward side points along (cos, -sin) on the page and its
  // downward side along (sin, cos).
  return {f.centreX + du * cs + dv * sn, f.centreY - du * sn + dv * cs};
}

AffineMap StraighteningMap(const PhotoFrame& f) {
  const double t = f.angleDegrees * std::numbers::pi / 180.0;
  const double cs = std::cos(t), sn = std::sin(t);
  // PagePointOf is in = A * out + k with A = {cs, sn, -sn, cs}; the forward map
  // is its inverse, out = A^T * (in - k).
  const PagePoint k = PagePointOf(f, 0.0, 0.0);
  AffineMap m;
  m.matrix = {cs, -sn, sn, cs};
  m.odx = -(cs * k.x - sn * k.y);
  m.ody = -(sn * k.x + cs * k.y);
  return m;
}

}  // namespace Fringe
