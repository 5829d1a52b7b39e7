// One side of an outline seen from its own frame: position t along the side
// from its first corner, offset s across it, positive outward.
#pragma once

#include "refine/geometry.h"

namespace Refine {

struct SideFrame {
  Vec2 start;    // the side's first corner
  Vec2 along;    // unit direction toward its second corner
  Vec2 outward;  // unit normal pointing away from the outline
  double length = 0.0;

  Vec2 At(double t, double s) const { return start + along * t + outward * s; }
  double AlongOf(Vec2 p) const { return Dot(p - start, along); }
  double AcrossOf(Vec2 p) const { return Dot(p - start, outward); }
};

// Side k (top, right, bottom, left) of a clockwise-on-screen quad.
SideFrame SideFrameOf(const Quad& quad, int side);

// The line s = offset + slope * t of a side frame, in page coordinates.
Line LineInFrame(const SideFrame& frame, double offset, double slope);

// The rectangle of pixel centres that may be sampled (inclusive).
struct SampleArea {
  double left = 0.0;
  double top = 0.0;
  double right = 0.0;
  double bottom = 0.0;

  bool Contains(Vec2 p) const { return p.x >= left && p.x <= right && p.y >= top && p.y <= bottom; }
};

}  // namespace Refine
