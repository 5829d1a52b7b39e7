// One page from start to finish: the module's answer on the page as it is,
// the page prepared where that is what made the module fail and the module
// run again on it, then refinement of the better answer in the page itself.
#pragma once

#include <optional>
#include <vector>

#include "refine/detector.h"
#include "refine/page_prep.h"
#include "refine/refine.h"

namespace Refine {

struct PipelineOptions {
  bool prepare = true;  // false: the module sees the page only as it is
  bool refine = true;   // false: the module's answer is passed on unrefined
  PrepareOptions preparation;
  RefineOptions refinement;
};

struct PipelineResult {
  ModuleAnswer raw;                       // the module's answer on the page as it is
  std::vector<Preparation> preparations;  // what was done before the second run
  std::optional<FilterRect> filterRect;   // the second run's filter rectangle
  std::optional<ModuleAnswer> prepared;   // the module's answer on the prepared page
  Refinement refined;                     // the final outline
  double detectSeconds = 0.0;             // both module runs
  double prepareSeconds = 0.0;
  double refineSeconds = 0.0;
};

PipelineResult DetectAndRefine(Detector& detector, const PageImage& page,
                               const PipelineOptions& options = {});

// The same, when the module has already given its answer on the page as it is.
PipelineResult RefineDetection(Detector& detector, const PageImage& page, const ModuleAnswer& raw,
                               const PipelineOptions& options = {});

}  // namespace Refine
