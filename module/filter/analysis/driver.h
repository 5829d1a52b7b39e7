// The analysis driver: runs every stage over the frame in a fixed order,
// reports progress, leaves the answer in the result and stores the record.
#pragma once

#include "filter/analysis/frame.h"
#include "filter/analysis/types.h"

namespace Project {

// One run over the frame the host delivered. Exceptions from the record
// writers pass through after everything the run holds is released.
void RunAnalysis(const FrameView& frame, AnalysisHost& host, AnalysisResult& result);

}  // namespace Project
