// Point, rectangle and corner-quad operations in the host's 16-bit convention.
#pragma once

#include <cstdint>

#include "filter/analysis/types.h"

namespace Project {

void SetPoint(Point& point, int16_t h, int16_t v);

// Intersects r with c in place; an empty result is left as it comes out.
void ClipRect(Rect& r, const Rect& c);

// The corners of the image rectangle, on its last row and column.
void FullImageCorners(CornerQuad& quad, const Rect& image);

// Adds dh to every h and dv to every v, wrapping in 16 bits.
void OffsetCorners(CornerQuad& quad, int16_t dh, int16_t dv);

}  // namespace Project
