// Sub-pixel positions of one known step along many lines across a side,
// each searched in a narrow window about where the side's reading expects it.
#pragma once

#include <vector>

#include "refine/line_fit.h"
#include "refine/page_image.h"
#include "refine/side_frame.h"

namespace Refine {

struct LocateRequest {
  double offset = 0.0;  // expected edge: s = offset + slope * (t - tCentre)
  double slope = 0.0;
  double tCentre = 0.0;
  int polarity = 0;          // +1 brighter outward, -1 darker outward
  double window = 2.5;       // px either side of the expected position
  double minGradient = 2.0;  // weakest step accepted, gray levels per px
  int smear = 1;             // lines averaged along the side per position
};

// One FitSample per line whose step was found (t, s, weight = gradient).
std::vector<FitSample> LocateEdges(const GraySampler& sampler, const SampleArea& area,
                                   const SideFrame& frame, const std::vector<double>& t,
                                   const LocateRequest& request);

}  // namespace Refine
