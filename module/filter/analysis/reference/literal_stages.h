// The analysis stages in their literal form: every sum in the defined order,
// every pixel addressed by the defined formula, nothing kept between pixels.
// Slow on purpose; the module's own stages must give the same bits, the same
// host calls and the same buffer contents.
#pragma once

#include <cstdint>

#include "filter/analysis/double_list.h"
#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"
#include "filter/analysis/stage_set.h"
#include "filter/analysis/types.h"

namespace Project::Reference {

void ComputeProfiles(const FrameView& frame, AnalysisHost& host, DoubleList& columns,
                     DoubleList& rows, ProgressCounter& progress);

void BuildEdgeMap(const FrameView& frame, AnalysisHost& host, int32_t threshold,
                  ProgressCounter& progress);

bool FindEdgePoints(const FrameView& frame, AnalysisHost& host, Rect search, DoubleList& xs,
                    DoubleList& ys, ProgressCounter& progress);

bool EstimateAngle(const DoubleList& xs, const DoubleList& ys, int32_t bins, double& angle);

bool FitBox(const DoubleList& xs, const DoubleList& ys, BoxCorners& corners,
            const AnalysisParams& params);

// All of the above, for RunAnalysisWith.
const StageSet& LiteralStages();

}  // namespace Project::Reference
