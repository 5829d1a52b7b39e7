// The analysis driver: runs every stage over the frame in a fixed order,
// reports progress, leaves the answer in the result and stores the record.
#pragma once

#include <cstdint>

#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"
#include "filter/analysis/stage_set.h"
#include "filter/analysis/types.h"

namespace Project {

// The parameter block of a W x H frame: minCount = trunc(0.15 x min(W, H)).
AnalysisParams MakeAnalysisParams(int16_t width, int16_t height);

// One run over the frame the host delivered. Exceptions from the record
// writers pass through after everything the run holds is released.
void RunAnalysis(const FrameView& frame, AnalysisHost& host, AnalysisResult& result);

// The same run through the given stage implementations.
void RunAnalysisWith(const StageSet& stages, const FrameView& frame, AnalysisHost& host,
                     AnalysisResult& result);

}  // namespace Project
