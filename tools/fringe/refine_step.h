// The step between detection and output: page preparation and refinement of
// the module's answer (the fringe_refine library), run on the decoded page
// with the module driven through the tool's own detector.
#pragma once

#include "page_loader.h"
#include "page_result.h"
#include "photo_detector.h"
#include "refined_answer.h"

namespace Fringe {

// Never changes the module's answer it is given. Preparation (a second run
// of the module) is left out when detection ran on a downscaled copy.
RefinedAnswer RefineOnPage(PhotoDetector& detector, const DecodedPage& page,
                           const ModuleAnswer& raw);

// The outline that drawing and cropping follow: the paper's edge, or the
// picture inside a white margin, as corners on the outermost pixels.
PhotoOutline OutlineFromRefined(const RefinedAnswer& refined, bool picture);

}  // namespace Fringe
