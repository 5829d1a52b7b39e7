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
// A photo shows at least one side clearly against the lid; faint steps
// alone are the lid's own shading or texture.
constexpr double kClearStep = 12.0;

struct SideWork {
  SideFrame frame;
  double trim = 0.0;  // length left out at each end of the side
  bool usable = false;
  AlignedProfile profile;
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

// From the middle of a side outward to the edge of the sampled area.
double DistanceToArea(const SampleArea& area, const SideFrame& frame) {
  const Vec2 mid = frame.At(0.5 * frame.length, 0.0);
  const Vec2 n = frame.outward;
  double d = 1e9;
  if (n.x > 1e-6) d = std::min(d, (area.right - mid.x) / n.x);
  if (n.x < -1e-6) d = std::min(d, (area.left - mid.x) / n.x);
  if (n.y > 1e-6) d = std::min(d, (area.bottom - mid.y) / n.y);
  if (n.y < -1e-6) d = std::min(d, (area.top - mid.y) / n.y);
  return std::max(0.0, d);
}

int SmearFor(double noise) {
  // Average enough lines along the side that a single profile's noise stays
  // near three gray levels.
  const double lines = (noise / 3.0) * (noise / 3.0);
  const int n = std::clamp(static_cast<int>(std::lround(lines)), 1, 9);
  return n | 1;
}

// The side's typical profile from sFrom to sTo across it.
AlignedProfile MeasureSide(const GraySampler& sampler, const SampleArea& area, const SideWork& work,
                           double sFrom, double sTo) {
  const double length = work.frame.length;
  const int lines = std::clamp(static_cast<int>(length / 16.0), 16, 32);
  const auto t = SpreadPositions(work.trim, length - work.trim, lines);
  const int width = static_cast<int>(std::floor(sTo - sFrom)) + 1;
  const ProfileStrip strip = SampleStrip(sampler, area, work.frame, t, sFrom, 1.0, width);
  return AlignProfiles(strip, std::tan(0.7 * kDegree));
}

// Fits the side's line to the step its reading chose, position by position.
void PlaceSide(const GraySampler& sampler, const SampleArea& area, SideWork& work) {
  const SideFrame& frame = work.frame;
  const SideReading& reading = work.reading;
  SideResult& result = work.result;
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
  const double length = frame.length;
  LocateRequest request;
  request.offset = reading.offset;
  request.slope = reading.slope;
  request.tCentre = reading.tCentre;
  request.polarity = reading.polarity;
  request.window = reading.band ? std::clamp(0.45 * reading.bandWidth, 1.5, 2.5) : 2.5;
  request.smear = SmearFor(reading.noise);
  const double lineNoise = reading.noise / std::sqrt(static_cast<double>(request.smear));
  request.minGradient = std::max({2.0, 3.0 * lineNoise, 0.25 * reading.gradient});
  const int fineLines = std::clamp(static_cast<int>(length / 6.0), 20, 128);
  const auto tFine = SpreadPositions(work.trim, length - work.trim, fineLines);
  const auto samples = LocateEdges(sampler, area, frame, tFine, request);
  const LineFitResult fit = FitLineRobust(samples);

  const double coarseOffset = reading.offset - reading.slope * reading.tCentre;
  const double midT = 0.5 * length;
  if (fit.ok) {
    const double support = static_cast<double>(fit.inliers) / fineLines;
    const double apart =
        std::abs((fit.offset + fit.slope * midT) - (coarseOffset + reading.slope * midT));
    if (support >= 0.3 && fit.rms <= 1.5 && apart <= 3.0 && std::abs(fit.slope) < 0.035) {
      result.status = SideStatus::kRefined;
      result.line = LineInFrame(frame, fit.offset, fit.slope);
      result.rms = fit.rms;
      result.support = support;
      result.shift = fit.offset + fit.slope * midT;
    }
  }
  if (result.status == SideStatus::kKept && reading.gradient >= 3.0) {
    // Too few single positions agree, but the typical profile shows the step clearly.
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
    if (innerFit.ok && static_cast<double>(innerFit.inliers) / fineLines >= 0.3 &&
        innerFit.rms <= 1.5)
      work.inner = LineInFrame(frame, innerFit.offset, innerFit.slope);
  }
}

// The picture's edge about `width` inside a side placed on the paper's edge.
std::optional<Line> FindInnerEdge(const GraySampler& sampler, const SampleArea& area,
                                  const SideWork& work, double width) {
  const SideReading& r = work.reading;
  LocateRequest request;
  request.offset = r.offset - width;
  request.slope = r.slope;
  request.tCentre = r.tCentre;
  request.polarity = 1;  // the picture is darker than its white margin
  request.window = std::max(2.5, 0.1 * width);
  request.smear = SmearFor(r.noise);
  request.minGradient =
      std::max(2.0, 3.0 * r.noise / std::sqrt(static_cast<double>(request.smear)));
  const int lines = std::clamp(static_cast<int>(work.frame.length / 6.0), 20, 128);
  const auto t = SpreadPositions(work.trim, work.frame.length - work.trim, lines);
  const LineFitResult fit = FitLineRobust(LocateEdges(sampler, area, work.frame, t, request));
  if (!fit.ok || static_cast<double>(fit.inliers) / lines < 0.3 || fit.rms > 1.5)
    return std::nullopt;
  return LineInFrame(work.frame, fit.offset, fit.slope);
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

// The outline's turn from the sides placed on steps in the page only: a page
// edge or a kept side says nothing about how the paper lies.
double AngleOfSides(const Quad& quad, const std::array<SideResult, 4>& sides, double fallback) {
  Quad masked = quad;
  double weighted = 0.0, total = 0.0, reference = 0.0;
  for (int k = 0; k < 4; ++k) {
    const SideStatus status = sides[k].status;
    if (status != SideStatus::kRefined && status != SideStatus::kCoarse &&
        status != SideStatus::kInferred)
      continue;
    const Vec2 d = masked[(k + 1) % 4] - masked[k];
    const double len = Length(d);
    double a = FoldedDirectionDegrees(d);
    if (total == 0.0) {
      reference = a;
    } else {
      if (a - reference > 45.0) a -= 90.0;
      if (a - reference < -45.0) a += 90.0;
    }
    weighted += a * len;
    total += len;
  }
  return total > 0.0 ? -(weighted / total) : fallback;
}

}  // namespace

std::string_view StatusName(RefineStatus status) {
  switch (status) {
    case RefineStatus::kRefined:
      return "refined";
    case RefineStatus::kPartial:
      return "partial";
    case RefineStatus::kKept:
      return "kept";
    case RefineStatus::kNoPhoto:
      return "no-photo";
  }
  return "unknown";
}

std::string_view StatusName(SideStatus status) {
  switch (status) {
    case SideStatus::kRefined:
      return "refined";
    case SideStatus::kCoarse:
      return "coarse";
    case SideStatus::kPageEdge:
      return "page-edge";
    case SideStatus::kInferred:
      return "inferred";
    case SideStatus::kKept:
      return "kept";
  }
  return "unknown";
}

ModuleAnswer ModuleAnswer::FromPoints(const std::array<int32_t, 8>& points, double angle,
                                      int confidence) {
  ModuleAnswer answer;
  for (size_t k = 0; k < 4; ++k)
    answer.corners[k] = {static_cast<double>(points[2 * k + 1]),
                         static_cast<double>(points[2 * k])};
  answer.angle = angle;
  answer.confidence = confidence;
  return answer;
}

Refinement Unrefined(const ModuleAnswer& answer, std::string reason) {
  Refinement out;
  out.status = answer.FoundPhoto() ? RefineStatus::kKept : RefineStatus::kNoPhoto;
  out.reason = std::move(reason);
  out.outline = answer.corners;
  out.picture = answer.corners;
  out.angle = answer.angle;
  for (int k = 0; k < 4; ++k) {
    if (auto line = LineThrough(answer.corners[k], answer.corners[(k + 1) % 4]))
      out.sides[k].line = *line;
  }
  return out;
}

SampleArea AreaToRead(const PageImage& page, const RefineOptions& options) {
  return options.area.value_or(SampleArea{0.0, 0.0, static_cast<double>(page.width - 1),
                                          static_cast<double>(page.height - 1)});
}

Refinement RefineOutline(const PageImage& page, const ModuleAnswer& answer,
                         const RefineOptions& options) {
  Refinement out = Unrefined(answer, "");
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

  const SampleArea area = AreaToRead(page, options);
  const GraySampler sampler(page);
  const double across = std::min(Distance(answer.corners[0], answer.corners[1]),
                                 Distance(answer.corners[1], answer.corners[2]));
  // Outward far enough for a white margin and its shadow; inward only as far
  // as a shadow band reaches (a side far inside is looked for again wider).
  const double reach = std::clamp(std::round(0.12 * across), 40.0, 200.0);
  const double reachIn = std::clamp(std::round(0.05 * across), 24.0, 100.0);
  // maxMargin stays inside the first search band so that a margin's outer edge is seen there.
  const double maxMargin = options.findMargin ? std::min(reach - 12.0, 0.12 * across) : 0.0;

  std::array<SideWork, 4> work;
  for (int k = 0; k < 4; ++k) {
    SideWork& w = work[k];
    w.frame = SideFrameOf(answer.corners, k);
    w.result.line = LineInFrame(w.frame, 0.0, 0.0);
    w.trim = std::max(10.0, 0.08 * w.frame.length);
    w.usable = w.frame.length >= 24.0;
    if (!w.usable) {
      w.result.note = "side too short";
      continue;
    }
    // Far enough in and out to meet the paper's edge even where the module
    // took its side from a shadow, a margin or dust.
    w.profile = MeasureSide(sampler, area, w, -reachIn, reach);
  }
  // The page's noise: the calmest side's (the lid is the same all round).
  double pageNoise = 0.0;
  for (const SideWork& w : work) {
    if (w.usable && w.profile.noise > 0.0 && (pageNoise == 0.0 || w.profile.noise < pageNoise))
      pageNoise = w.profile.noise;
  }
  const LidEstimate lid = options.lid ? *options.lid : EstimateLid(page);
  ReadOptions readOptions;
  readOptions.maxMarginWidth = maxMargin;
  readOptions.pageNoise = pageNoise;
  for (int k = 0; k < 4; ++k) {
    SideWork& w = work[k];
    if (!w.usable) continue;
    if (lid.level > 0.0) {
      // The lid a little way beyond the middle of the side.
      const Vec2 p = w.frame.At(0.5 * w.frame.length, 0.25 * reach);
      readOptions.expectedLid = LidAt(lid, p.x / page.width, p.y / page.height);
      readOptions.lidTolerance = std::max(6.0, 3.0 * lid.residual) + 2.5 * pageNoise;
    }
    w.reading = ReadSide(w.profile, readOptions);
    if (!w.reading.found) {
      // The module's side is far off (a bed strip, dust, a picture edge taken
      // for the paper's): look again in a band three times as wide.
      // Outward, as far as the page's edge if the paper may run on to it.
      const double in = std::min(3.0 * reach, 0.45 * across);
      const double outward =
          std::min(std::max(3.0 * reach, DistanceToArea(area, w.frame) + 2.0), across);
      AlignedProfile wide = MeasureSide(sampler, area, w, -in, outward);
      SideReading again = ReadSide(wide, readOptions);
      if (again.found) {
        again.note += " (found in a wider search)";
        w.profile = std::move(wide);
        w.reading = again;
      }
    }
    if (w.reading.found && !w.reading.pageEdge && w.reading.paleInside && !w.reading.margin &&
        maxMargin > 0.0) {
      // A pale calm stretch inside the paper's edge that runs past the first
      // band: look deeper in for where the picture begins.
      const double deeper = std::max(reachIn, maxMargin + 12.0 - w.reading.offset);
      AlignedProfile deep =
          MeasureSide(sampler, area, w, -deeper, std::min(reach, w.reading.offset + 48.0));
      SideReading again = ReadSide(deep, readOptions);
      if (again.found && again.margin && std::abs(again.offset - w.reading.offset) <= 1.5) {
        w.profile = std::move(deep);
        w.reading = again;
      }
    }
    if (options.inspect) options.inspect(k, w.profile, w.reading);
    PlaceSide(sampler, area, w);
  }

  // A white margin is a property of the print: believe it only where most
  // sides show one, then carry its width to sides where it cannot be seen.
  std::vector<double> widths;
  for (int k = 0; k < 4; ++k) {
    if (work[k].innerFound && work[k].result.status != SideStatus::kKept)
      widths.push_back(MidShiftBetween(work[k].frame, work[k].result.line, work[k].inner));
  }
  // Two sides whose widths agree, or three or more.
  bool margin = widths.size() >= 3;
  if (widths.size() == 2)
    margin = std::abs(widths[0] - widths[1]) <= std::max(4.0, 0.2 * std::max(widths[0], widths[1]));
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
      const bool placed =
          w.result.status == SideStatus::kRefined || w.result.status == SideStatus::kCoarse;
      const Line& l = w.result.line;
      if (placed && (w.reading.band || w.reading.polarity < 0)) {
        // The side found is the paper's own edge (brighter than the lid, or
        // behind its shadow): the picture begins a margin further in.
        innerLines[k] = FindInnerEdge(sampler, area, w, width)
                            .value_or(Line{l.point - w.frame.outward * width, l.direction});
        continue;
      }
      // The side found is the picture's edge; the paper's lies a margin further out.
      innerLines[k] = l;
      if (placed) {
        w.result.line = Line{l.point + w.frame.outward * width, l.direction};
        w.result.status = SideStatus::kInferred;
        w.result.note = "margin too faint to see; width taken from the other sides";
      }
    }
  }

  std::array<Line, 4> lines{};
  int refined = 0;
  int clear = 0;  // sides placed on a clear step seen in the page
  for (int k = 0; k < 4; ++k) {
    lines[k] = work[k].result.line;
    out.sides[k] = work[k].result;
    const SideStatus status = work[k].result.status;
    if (status != SideStatus::kKept) ++refined;
    // A margin with the picture inside it, or the lid's shadow band, is as
    // clear as a strong step.
    const SideReading& r = work[k].reading;
    if ((status == SideStatus::kRefined || status == SideStatus::kCoarse) &&
        (work[k].result.contrast >= kClearStep || r.margin || r.band))
      ++clear;
  }
  if (clear == 0) {
    // Not one side of the module's outline lies on a step in the page: what
    // it found is lid texture, noise or the page's own edge.
    out.status = RefineStatus::kNoPhoto;
    out.reason = "no edge along the module's outline: nothing on the page stands out";
    return out;
  }

  const auto corners = CornersOf(lines);
  if (!corners || !IsConvexClockwise(*corners)) {
    out.status = RefineStatus::kKept;
    out.reason = "the refined sides do not meet in an outline";
    return out;
  }
  // Each corner may move as far as its two sides moved, and a little more
  // for their turn; further means two sides met at a glancing angle.
  for (int k = 0; k < 4; ++k) {
    const bool offPage = work[k].result.status == SideStatus::kPageEdge ||
                         work[(k + 3) % 4].result.status == SideStatus::kPageEdge;
    const double limit = std::abs(work[k].result.shift) + std::abs(work[(k + 3) % 4].result.shift) +
                         0.05 * across + 10.0 + (margin ? maxMargin : 0.0);
    if (!offPage && Distance((*corners)[k], answer.corners[k]) > limit) {
      out.status = RefineStatus::kKept;
      out.reason = "the refined outline strays too far from the module's";
      return out;
    }
  }

  out.outline = *corners;
  out.angle = AngleOfSides(*corners, out.sides, answer.angle);
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
