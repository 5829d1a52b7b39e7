// Runs the module, prepares and reruns where needed, refines.
#include "refine/pipeline.h"

#include <chrono>
#include <optional>

#include "refine/lid_seed.h"

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

// Refinement started from the region that departs from the lid, when that
// region holds the module's box: its sides are then where the photo's are.
// Returns it only when it does better than `current`.
std::optional<Refinement> RefineFromLidSeed(const PageImage& page, const ModuleAnswer& module,
                                            const RefineOptions& options,
                                            const Refinement& current) {
  const bool complete = Rank(current) >= 3;
  // The caller measured the lid once for every refinement of the page.
  const LidEstimate& lid = *options.lid;
  const SampleArea area = AreaToRead(page, options);
  // A complete outline is looked at again only when the page just outside it
  // is not lid; cheap to ask first, as the seed reads the whole page.
  if (complete && !DepartsOutside(page, lid, area, current.outline)) return std::nullopt;
  const std::optional<LidSeed> seed = SeedFromLid(page, lid, area);
  if (!seed) return std::nullopt;
  // A complete outline well inside a solid region was taken from inner edges.
  constexpr double kGrowth = 1.15;
  if (complete &&
      !(seed->coverage > 0.9 && QuadArea(seed->corners) > kGrowth * QuadArea(current.outline)))
    return std::nullopt;
  const Vec2 centre = (module.corners[0] + module.corners[2]) * 0.5;
  for (int k = 0; k < 4; ++k) {
    const Vec2 a = seed->corners[k], b = seed->corners[(k + 1) % 4];
    if (Cross(b - a, centre - a) < 0.0) return std::nullopt;
  }
  ModuleAnswer start;
  start.corners = seed->corners;
  start.angle = seed->angle;
  start.confidence = 255;
  Refinement out = RefineOutline(page, start, options);
  if (Rank(out) < Rank(current)) return std::nullopt;
  if (complete && !(QuadArea(out.outline) > kGrowth * QuadArea(current.outline)))
    return std::nullopt;
  if (Rank(out) == Rank(current) && !complete) return std::nullopt;
  if (out.status == RefineStatus::kRefined)
    out.reason = "every side found again around the photo's extent on the lid";
  return out;
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
    // Measured once here, when there is a photo to refine: each refinement
    // below and the lid seed read it.
    if (!refineOptions.lid && chosen.FoundPhoto()) refineOptions.lid = EstimateLid(page);
    result.refined = RefineOutline(page, chosen, refineOptions);
    // The module's first answer may still serve better than the prepared one.
    if (result.prepared && result.raw.FoundPhoto() && Rank(result.refined) < 2) {
      Refinement other = RefineOutline(page, result.raw, refineOptions);
      if (Rank(other) > Rank(result.refined)) result.refined = std::move(other);
    }
    // The module's box may hold only part of the photo: some sides then stay
    // unfound, or are found on the photo's own inner edges, well inside the
    // region that departs from the lid.
    if (chosen.FoundPhoto()) {
      if (auto other = RefineFromLidSeed(page, chosen, refineOptions, result.refined)) {
        result.refined = std::move(*other);
      }
    }
  }
  result.refineSeconds = Since(start);
  return result;
}

}  // namespace Refine
