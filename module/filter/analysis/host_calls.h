// The two host calls every stage makes: a progress step and the abort test
// with the cancel convention.
#pragma once

#include <cstdint>

#include "filter/analysis/frame.h"
#include "filter/analysis/records.h"

namespace Project {

// The host's code for a user cancel, stored in the filter's result code.
inline constexpr int16_t kUserCanceled = -128;

// done + 1, then the host's progress procedure with (done, total).
void TakeProgressStep(ProgressCounter& progress, AnalysisHost& host);

// Asks the host's abort test; on a cancel stores the cancel code in the
// filter's result code and answers true, so that the caller stops.
bool CancelRequested(AnalysisHost& host);

}  // namespace Project
