// The module's last analysis answer: one per loaded module, zero at load,
// never reset between runs.
#pragma once

#include "filter/analysis/types.h"

namespace Project {

AnalysisResult& ModuleAnalysisResult();

}  // namespace Project
