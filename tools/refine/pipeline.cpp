// Runs the module, prepares and reruns where needed, refines.
#include "refine/pipeline.h"

#include <chrono>

namespace Refine {
namespace {

double Since(std::chrono::steady_clock::time_point start) {
  return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

// How good a refinement is, for choosing between two.
int Rank(const Refinement& r) {
  switch (r.status) {
    case RefineStatus::kRefined:
      return 3;
    case RefineStatus::kPartial:
      return 2;
    case RefineStatus::kKept:
      return 1;
    case RefineStatus::kNoPhoto:
      return 0;
  }
  return 0;
}

}  // namespace

PipelineResult DetectAndRefine(Detector& detector, const PageImage& page,
                               const PipelineOptions& options) {
  const auto start = std::chrono::steady_clock::now();
  const ModuleAnswer raw = detector.Detect(page, std::nullopt);
  const double seconds = Since(start);
  PipelineResult result = RefineDetection(detector, page, raw, options);
  result.detectSeconds += seconds;
  return result;
}

PipelineResult RefineDetection(Detector& detector, const PageImage& page, const ModuleAnswer& raw,
                               const PipelineOptions& options) {
  PipelineResult result;
  result.raw = raw;
  auto start = std::chrono::steady_clock::now();
  ModuleAnswer chosen = result.raw;
  RefineOptions refineOptions = options.refinement;
  if (options.prepare) {
    start = std::chrono::steady_clock::now();
    const PreparedPage prepared = PreparePage(page, options.preparation);
    result.prepareSeconds = Since(start);
    if (!refineOptions.lid && prepared.survey.lidLevel > 0.0)
      refineOptions.lid = prepared.survey.lid;
    if (!prepared.steps.empty()) {
      result.preparations = prepared.steps;
      result.filterRect = prepared.filterRect;
      start = std::chrono::steady_clock::now();
      result.prepared = detector.Detect(prepared.view, prepared.filterRect);
      result.detectSeconds += Since(start);
      if (result.prepared->FoundPhoto() || !result.raw.FoundPhoto()) chosen = *result.prepared;
      if (prepared.filterRect && !refineOptions.area) {
        const FilterRect& r = *prepared.filterRect;
        refineOptions.area =
            SampleArea{static_cast<double>(r[1]), static_cast<double>(r[0]),
                       static_cast<double>(r[3] - 1), static_cast<double>(r[2] - 1)};
      }
    }
  }

  start = std::chrono::steady_clock::now();
  if (!options.refine) {
    result.refined = Unrefined(chosen, "refinement switched off");
  } else {
    result.refined = RefineOutline(page, chosen, refineOptions);
    // The module's first answer may still serve better than the prepared one.
    if (result.prepared && result.raw.FoundPhoto() && Rank(result.refined) < 2) {
      Refinement other = RefineOutline(page, result.raw, refineOptions);
      if (Rank(other) > Rank(result.refined)) result.refined = std::move(other);
    }
  }
  result.refineSeconds = Since(start);
  return result;
}

}  // namespace Refine
