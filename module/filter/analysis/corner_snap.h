// Finishing the published corners: rounding the fitted corners into 16-bit
// points and snapping sides that lie just inside the image onto its border.
#pragma once

#include "filter/analysis/records.h"
#include "filter/analysis/types.h"

namespace Project {

// Corner k + 1 = c[k] with v = y and h = x rounded half away from zero,
// truncated to 32 bits and kept as the low 16 bits.
void RoundCorners(const BoxCorners& box, CornerQuad& quad);

// Left, top, right and bottom in turn: when both corners of a side lie 1 to
// 12 pixels inside the rectangle's border, both move onto it (onto the last
// column or row for the right and bottom sides).
void SnapCorners(CornerQuad& quad, const Rect& r);

}  // namespace Project
