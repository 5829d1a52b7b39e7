// A second starting outline for refinement, from where the page departs from
// the lid: the smallest rectangle around the largest such region. It serves
// when the module's box took only part of a photo (a faint photo whose own
// inner edges were stronger than its sides), so that refinement can look for
// the sides where they really are.
#pragma once

#include <optional>

#include "refine/geometry.h"
#include "refine/lid_level.h"
#include "refine/page_image.h"
#include "refine/side_frame.h"

namespace Refine {

struct LidSeed {
  Quad corners{};  // clockwise from the top-left, as the module gives them
  double angle = 0.0;
  double coverage = 0.0;  // share of the rectangle's blocks that depart from the lid
};

// Nothing when no region large enough departs from the lid within the area.
std::optional<LidSeed> SeedFromLid(const PageImage& page, const LidEstimate& lid,
                                   const SampleArea& area);

// True when, just outside some side of the outline, the page mostly departs
// from the lid: the outline may lie inside a larger region. A few dozen reads.
bool DepartsOutside(const PageImage& page, const LidEstimate& lid, const SampleArea& area,
                    const Quad& outline);

// The smallest-area rectangle around a set of points (rotating the frame to
// each edge of their convex hull), clockwise from its top-left corner.
// Nothing for fewer than three points not on one line.
std::optional<Quad> MinimumAreaRectangle(std::vector<Vec2> points);

}  // namespace Refine
