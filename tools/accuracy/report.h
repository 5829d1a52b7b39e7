// The accuracy report: raw module answers and refined outlines side by side,
// as Markdown tables.
#pragma once

#include <string>
#include <vector>

#include "accuracy/run.h"

namespace Accuracy {

// Detection rate at 10 px, corner and angle errors, blank pages, times.
std::string SummaryTable(const std::vector<PageOutcome>& outcomes);

// Pages found and median corner error, kind by kind.
std::string KindTable(const std::vector<PageOutcome>& outcomes);

// One line per page: errors, refinement status, preparations.
std::string PageLine(const PageOutcome& outcome);

}  // namespace Accuracy
