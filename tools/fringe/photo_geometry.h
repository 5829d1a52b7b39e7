// Geometry of the detected photo: its straightened frame (centre, size and
// turn) and the affine transform that cuts it out of the page upright.
#pragma once

#include <array>

#include "page_result.h"

namespace Fringe {

// The photo as an upright rectangle turned about its centre.
struct PhotoFrame {
  double centreX = 0.0;
  double centreY = 0.0;
  int width = 0;   // pixels across, corners included
  int height = 0;  // pixels down, corners included
  double angleDegrees = 0.0;
};

// The module's corners are those of an upright box turned by the published
// angle: a positive angle turns the photo's top side from pointing right
// towards pointing up on the page. margin pixels are added on every side.
PhotoFrame FrameOfPhoto(const std::array<Corner, 4>& corners, double angleDegrees, int margin);

// vips affine parameters mapping page pixels onto the upright photo:
// out = M * in + (odx, ody), M = {a, b, c, d}.
struct AffineMap {
  std::array<double, 4> matrix{};
  double odx = 0.0;
  double ody = 0.0;
};

AffineMap StraighteningMap(const PhotoFrame& frame);

// Where an output pixel of the straightened photo lies on the page.
struct PagePoint {
  double x = 0.0;
  double y = 0.0;
};
PagePoint PagePointOf(const PhotoFrame& frame, double u, double v);

}  // namespace Fringe
