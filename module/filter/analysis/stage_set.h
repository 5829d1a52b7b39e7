// The set of stage implementations a run goes through. The module runs its
// own; tests and benchmarks hand the driver the literal set to compare
// whole runs call by call.
#pragma once

#include <cstdint>

#include "filter/analysis/double_list.h"
#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"
#include "filter/analysis/types.h"

namespace Project {

struct StageSet {
  void (*computeProfiles)(const FrameView& frame, AnalysisHost& host, DoubleList& columns,
                          DoubleList& rows, ProgressCounter& progress);
  void (*buildEdgeMap)(const FrameView& frame, AnalysisHost& host, int32_t threshold,
                       ProgressCounter& progress);
  bool (*findEdgePoints)(const FrameView& frame, AnalysisHost& host, Rect search, DoubleList& xs,
                         DoubleList& ys, ProgressCounter& progress);
  bool (*estimateAngle)(const DoubleList& xs, const DoubleList& ys, int32_t bins, double& angle);
  bool (*fitBox)(const DoubleList& xs, const DoubleList& ys, BoxCorners& corners,
                 const AnalysisParams& params);
};

// The stages the module runs.
const StageSet& ModuleStages();

}  // namespace Project
