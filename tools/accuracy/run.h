// One accuracy run: every page through detection, preparation and
// refinement, each answer scored against the page's truth.
#pragma once

#include <array>
#include <functional>
#include <string>
#include <vector>

#include "accuracy/evaluation.h"
#include "accuracy/page_cases.h"
#include "refine/pipeline.h"

namespace Accuracy {

struct PageOutcome {
  std::string name;
  std::string kind;
  Score raw;      // the module's answer on the page as it is
  Score refined;  // after preparation and refinement
  Answer rawAnswer, refinedAnswer;
  std::string status;                // refinement status
  std::array<std::string, 4> sides;  // each side's status and what decided it
  std::vector<std::string> preparations;
  double detectMs = 0.0, prepareMs = 0.0, refineMs = 0.0;
};

// The module's answer (pixel indices) and the refined outline (pixel centres
// at integers) in the truth's continuous coordinates.
Answer RawAnswerOf(const Refine::ModuleAnswer& answer);
Answer RefinedAnswerOf(const Refine::Refinement& refined);

PageOutcome RunCase(Refine::Detector& detector, const PageCase& c,
                    const Refine::PipelineOptions& options);

}  // namespace Accuracy
