// Side frames of an outline.
#include "refine/side_frame.h"

namespace Refine {

SideFrame SideFrameOf(const Quad& quad, int side) {
  SideFrame frame;
  frame.start = quad[side];
  const Vec2 d = quad[(side + 1) % 4] - quad[side];
  frame.length = Length(d);
  frame.along = frame.length > 0.0 ? d * (1.0 / frame.length) : Vec2{1.0, 0.0};
  // With y downward the outline runs clockwise on screen, so outward is the
  // direction turned a quarter turn anticlockwise on screen.
  frame.outward = {frame.along.y, -frame.along.x};
  return frame;
}

Line LineInFrame(const SideFrame& frame, double offset, double slope) {
  const Vec2 point = frame.At(0.0, offset);
  const Vec2 dir = frame.along + frame.outward * slope;
  return Line{point, dir * (1.0 / Length(dir))};
}

}  // namespace Refine
