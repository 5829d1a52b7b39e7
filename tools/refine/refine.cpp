// Per side: profiles across the module's side, lined up and read for the
// paper's edge; edge positions along the side; a robust line. Then the
// margin's inner outline, the corners and the checks that decide between the
// refined outline and the module's.
#include "refine/refine.h"

#include <algorithm>
#include <cmath>
#include <numbers>
#include <vector>

#include "refine/aligned_profile.h"
#include "refine/edge_locate.h"
#include "refine/line_fit.h"
#include "refine/profile_strip.h"
#include "refine/side_reading.h"

namespace Refine {
namespace {

constexpr double kDegree = std::numbers::pi / 180.0;

struct SideWork {
  SideFrame frame;
  SideReading reading;
  SideResult result;
  bool innerFound = false;
  Line inner{};
};

// Where the page's own edge lies beyond a side, as a line.
Line PageEdgeLine(const SampleArea& area, const SideFrame& frame) {
  const Vec2 n = frame.outward;
  if (std::abs(n.x) >= std::abs(n.y)) {
    const double x = n.x > 0.0 ? area.right + 0.5 : area.left - 0.5;
    return Line{{x, 0.0}, {0.0, 1.0}};
  }
  const double y = n.y > 0.0 ? area.bottom + 0.5 : area.top - 0.5;
  return Line{{0.0, y}, {1.0, 0.0}};
}

int SmearFor(double noise) {
  // Average enough lines along the side that a single profile's noise stays
  // near three gray levels.
  const double lines = (noise / 3.0) * (noise / 3.0);
  const int n = std::clamp(static_cast<int>(std::lround(lines)), 1, 9);
  return n | 1;
}

void RefineSide(const GraySampler& sampler, const SampleArea& area, const Quad& quad, int side,
                double searchReach, double maxMargin, SideWork& work) {
  work.frame = SideFrameOf(quad, side);
  const SideFrame& frame = work.frame;
  SideResult& result = work.result;
  result.status = SideStatus::kKept;
  result.line = LineInFrame(frame, 0.0, 0.0);
  const double length = frame.length;
  if (length < 24.0) {
    result.note = "side too short";
    return;
  }
  // Stay clear of the corners, where the neighbouring side's edge and shadow lie.
  const double trim = std::max(10.0, 0.08 * length);

  // The structure: profiles far enough in and out to meet the paper's edge
  // even where the module took its side from a shadow, a margin or dust.
  const int structureLines = std::clamp(static_cast<int>(length / 6.0), 16, 120);
  const auto tStructure = SpreadPositions(trim, length - trim, structureLines);
  const int width = 2 * static_cast<int>(searchReach) + 1;
  const ProfileStrip strip = SampleStrip(sampler, area, frame, tStructure, -searchReach, 1.0, width);
  const AlignedProfile aligned = AlignProfiles(strip, std::tan(0.7 * kDegree));
  ReadOptions readOptions;
  readOptions.maxMarginWidth = maxMargin;
  work.reading = ReadSide(aligned, readOptions);
  const SideReading& reading = work.reading;
  result.note = reading.note;
  result.band = reading.band;
  result.margin = reading.margin;
  result.contrast = reading.contrast;
  if (!reading.found) return;

  if (reading.pageEdge) {
    result.status = SideStatus::kPageEdge;
    result.line = PageEdgeLine(area, frame);
    result.shift = reading.offset;
    return;
  }

  // Every position along the side: the step the reading chose, in a window
  // narrow enough to keep the shadow band's other side out.
  LocateRequest request;
  request.offset = reading.offset;
  request.slope = reading.slope;
  request.tCentre = reading.tCentre;
  request.polarity = reading.polarity;
  request.window = reading.band ? std::clamp(0.45 * reading.bandWidth, 1.5, 2.5) : 2.5;
  request.smear = SmearFor(reading.noise);
  const double lineNoise = reading.noise / std::sqrt(static_cast<double>(request.smear));
  request.minGradient = std::max({2.0, 3.0 * lineNoise, 0.25 * reading.gradient});
  const int fineLines = std::clamp(static_cast<int>(length / 2.0), 20, 500);
  const auto tFine = SpreadPositions(trim, length - trim, fineLines);
  const auto samples = LocateEdges(sampler, area, frame, tFine, request);
  const LineFitResult fit = FitLineRobust(samples);

  const double coarseOffset = reading.offset - reading.slope * reading.tCentre;
  const double midT = 0.5 * length;
  if (fit.ok) {
    const double support = static_cast<double>(fit.inliers) / fineLines;
    const double apart = std::abs((fit.offset + fit.slope * midT) - (coarseOffset + reading.slope * midT));
    if (support >= 0.3 && fit.rms <= 1.5 && apart <= 3.0 && std::abs(fit.slope) < 0.035) {
      result.status = SideStatus::kRefined;
      result.line = LineInFrame(frame, fit.offset, fit.slope);
      result.rms = fit.rms;
      result.support = support;
      result.shift = fit.offset + fit.slope * midT;
    }
  }
  if (result.status == SideStatus::kKept && reading.gradient >= 3.0) {
    // Too few single positions agree, but the mean profile shows the step clearly.
    result.status = SideStatus::kCoarse;
    result.line = LineInFrame(frame, coarseOffset, reading.slope);
    result.support = fit.ok ? static_cast<double>(fit.inliers) / fineLines : 0.0;
    result.rms = fit.ok ? fit.rms : 0.0;
    result.shift = coarseOffset + reading.slope * midT;
  }

  if (reading.margin) {
    const double innerOffset = reading.innerOffset - reading.slope * reading.tCentre;
    work.innerFound = true;
    work.inner = LineInFrame(frame, innerOffset, reading.slope);
    LocateRequest innerRequest = request;
    innerRequest.offset = reading.innerOffset;
    innerRequest.polarity = reading.innerPolarity;
    innerRequest.window = 2.5;
    innerRequest.minGradient = std::max(2.0, 3.0 * lineNoise);
    const auto innerSamples = LocateEdges(sampler, area, frame, tFine, innerRequest);
    const LineFitResult innerFit = FitLineRobust(innerSamples);
    if (innerFit.ok && static_cast<double>(innerFit.inliers) / fineLines >= 0.3 && innerFit.rms <= 1.5)
      work.inner = LineInFrame(frame, innerFit.offset, innerFit.slope);
  }
}

double MidShiftBetween(const SideFrame& frame, const Line& outer, const Line& inner) {
  // Distance from inner to outer along the side's outward normal, at mid-side.
  const Vec2 mid = frame.At(0.5 * frame.length, 0.0);
  auto across = [&](const Line& line) {
    const double denom = Dot(line.direction, frame.along);
    const double t = Dot(mid - line.point, frame.along) / (std::abs(denom) > 1e-9 ? denom : 1e-9);
    return frame.AcrossOf(line.point + line.direction * t);
  };
  return across(outer) - across(inner);
}

}  // namespace

std::string_view StatusName(RefineStatus status) {
  switch (status) {
    case RefineStatus::kRefined: return "refined";
    case RefineStatus::kPartial: return "partial";
    case RefineStatus::kKept: return "kept";
    case RefineStatus::kNoPhoto: return "no-photo";
  }
  return "unknown";
}

std::string_view StatusName(SideStatus status) {
  switch (status) {
    case SideStatus::kRefined: return "refined";
    case SideStatus::kCoarse: return "coarse";
    case SideStatus::kPageEdge: return "page-edge";
    case SideStatus::kInferred: return "inferred";
    case SideStatus::kKept: return "kept";
  }
  return "unknown";
}

ModuleAnswer ModuleAnswer::FromPoints(const std::array<int32_t, 8>& points, double angle, int confidence) {
  ModuleAnswer answer;
  for (size_t k = 0; k < 4; ++k)
    answer.corners[k] = {static_cast<double>(points[2 * k + 1]), static_cast<double>(points[2 * k])};
  answer.angle = angle;
  answer.confidence = confidence;
  return answer;
}

Refinement RefineOutline(const PageImage& page, const ModuleAnswer& answer, const RefineOptions& options) {
  Refinement out;
  out.outline = answer.corners;
  out.picture = answer.corners;
  out.angle = answer.angle;
  for (int k = 0; k < 4; ++k) {
    if (auto line = LineThrough(answer.corners[k], answer.corners[(k + 1) % 4])) out.sides[k].line = *line;
  }
  if (const std::string problem = CheckPageImage(page); !problem.empty()) {
    out.status = RefineStatus::kKept;
    out.reason = problem;
    return out;
  }
  if (!answer.FoundPhoto()) {
    out.status = RefineStatus::kNoPhoto;
    out.reason = "the module found no photo";
    return out;
  }
  if (!IsConvexClockwise(answer.corners)) {
    out.status = RefineStatus::kKept;
    out.reason = "the module's corners do not form an outline";
    return out;
  }

  const SampleArea area = options.area.value_or(
      SampleArea{0.0, 0.0, static_cast<double>(page.width - 1), static_cast<double>(page.height - 1)});
  const GraySampler sampler(page);
  const double across = std::min(Distance(answer.corners[0], answer.corners[1]),
                                 Distance(answer.corners[1], answer.corners[2]));
  const double reach = std::clamp(std::round(0.12 * across), 40.0, 200.0);
  const double maxMargin = options.findMargin ? std::min(reach - 12.0, 0.12 * across) : 0.0;

  std::array<SideWork, 4> work;
  for (int k = 0; k < 4; ++k) RefineSide(sampler, area, answer.corners, k, reach, maxMargin, work[k]);

  // A white margin is a property of the print: believe it only where most
  // sides show one, then carry its width to sides where it cannot be seen.
  std::vector<double> widths;
  for (int k = 0; k < 4; ++k) {
    if (work[k].innerFound && work[k].result.status != SideStatus::kKept)
      widths.push_back(MidShiftBetween(work[k].frame, work[k].result.line, work[k].inner));
  }
  const bool margin = widths.size() >= 3;
  std::array<Line, 4> innerLines{};
  if (margin) {
    std::sort(widths.begin(), widths.end());
    const double width = widths[widths.size() / 2];
    for (int k = 0; k < 4; ++k) {
      SideWork& w = work[k];
      if (w.innerFound && w.result.status != SideStatus::kKept) {
        innerLines[k] = w.inner;
        continue;
      }
      // The side found is the picture's edge; the paper's lies a margin further out.
      innerLines[k] = w.result.line;
      if (w.result.status == SideStatus::kRefined || w.result.status == SideStatus::kCoarse) {
        const Line& l = w.result.line;
        w.result.line = Line{l.point + w.frame.outward * width, l.direction};
        w.result.status = SideStatus::kInferred;
        w.result.note = "margin too faint to see; width taken from the other sides";
      }
    }
  }

  std::array<Line, 4> lines{};
  int refined = 0;
  for (int k = 0; k < 4; ++k) {
    lines[k] = work[k].result.line;
    out.sides[k] = work[k].result;
    if (work[k].result.status != SideStatus::kKept) ++refined;
  }
  if (refined == 0) {
    bool anyStep = false;
    for (const SideWork& w : work) anyStep = anyStep || w.reading.found;
    out.status = anyStep ? RefineStatus::kKept : RefineStatus::kNoPhoto;
    out.reason = anyStep ? "no side could be placed more precisely"
                         : "no edge near the module's outline: nothing on the page stands out";
    return out;
  }

  const auto corners = CornersOf(lines);
  if (!corners || !IsConvexClockwise(*corners)) {
    out.status = RefineStatus::kKept;
    out.reason = "the refined sides do not meet in an outline";
    return out;
  }
  // The refined outline must stay near the module's: each corner within the
  // search reach (plus a margin's width) of the module's corner.
  const double limit = reach * 1.5 + (margin ? maxMargin : 0.0);
  for (int k = 0; k < 4; ++k) {
    const bool offPage = work[k].result.status == SideStatus::kPageEdge ||
                         work[(k + 3) % 4].result.status == SideStatus::kPageEdge;
    if (!offPage && Distance((*corners)[k], answer.corners[k]) > limit) {
      out.status = RefineStatus::kKept;
      out.reason = "the refined outline strays too far from the module's";
      return out;
    }
  }

  out.outline = *corners;
  out.angle = OutlineAngleDegrees(*corners);
  out.status = refined == 4 ? RefineStatus::kRefined : RefineStatus::kPartial;
  out.reason = refined == 4 ? "every side found again" : "some sides kept from the module's answer";
  out.picture = *corners;
  if (margin) {
    if (const auto inner = CornersOf(innerLines); inner && IsConvexClockwise(*inner)) {
      out.margin = true;
      out.picture = *inner;
    }
  }
  return out;
}

}  // namespace Refine
