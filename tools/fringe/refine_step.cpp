// The module behind the refinement library's detector interface, and the
// library's result turned into the tool's.
#include "refine_step.h"

#include <cmath>

#include "refine/geometry.h"
#include "refine/pipeline.h"
#include "standin/detect.h"

namespace Fringe {
namespace {

Refine::ModuleAnswer ToRefine(const ModuleAnswer& a) {
  Refine::ModuleAnswer r;
  for (size_t k = 0; k < 4; ++k)
    r.corners[k] = {static_cast<double>(a.corners[k].x), static_cast<double>(a.corners[k].y)};
  r.angle = a.angle;
  r.confidence = a.confidence;
  return r;
}

// Runs the module on the page or a prepared copy of it.
class ToolDetector : public Refine::Detector {
 public:
  explicit ToolDetector(PhotoDetector& detector) : detector_(detector) {}

  Refine::ModuleAnswer Detect(const Refine::PageImage& page,
                              const std::optional<Refine::FilterRect>& rect) override {
    Standin::PageView view;
    view.width = page.width;
    view.height = page.height;
    view.channels = page.channels;
    view.alpha = page.pixelBytes > page.channels;
    view.pixels = page.pixels;
    view.rowBytes = page.rowBytes;
    return ToRefine(detector_.DetectPixels(view, rect));
  }

 private:
  PhotoDetector& detector_;
};

std::array<OutlinePoint, 4> PointsOf(const Refine::Quad& q) {
  std::array<OutlinePoint, 4> points{};
  for (size_t k = 0; k < 4; ++k) points[k] = {q[k].x, q[k].y};
  return points;
}

}  // namespace

RefinedAnswer RefineOnPage(PhotoDetector& detector, const DecodedPage& page,
                           const ModuleAnswer& raw) {
  const Refine::PageImage view{page.width,    page.height,
                               page.channels, page.channels + (page.alpha ? 1 : 0),
                               page.Pixels(), page.RowBytes()};
  Refine::PipelineOptions options;
  options.prepare = raw.detectScale == 1.0;
  ToolDetector tool(detector);
  const Refine::PipelineResult result = Refine::RefineDetection(tool, view, ToRefine(raw), options);

  const Refine::Refinement& f = result.refined;
  RefinedAnswer r;
  r.present = true;
  r.status = std::string(Refine::StatusName(f.status));
  r.reason = f.reason;
  r.found = f.status != Refine::RefineStatus::kNoPhoto;
  r.outline = PointsOf(f.outline);
  r.angle = f.angle;
  for (size_t k = 0; k < 4; ++k) {
    const Refine::SideResult& s = f.sides[k];
    r.sides[k] = {std::string(Refine::StatusName(s.status)),
                  s.rms,
                  s.support,
                  s.contrast,
                  s.band,
                  s.margin,
                  s.note};
  }
  r.margin = f.margin;
  r.picture = PointsOf(f.picture);
  for (const Refine::Preparation& p : result.preparations)
    r.preparations.push_back({p.kind, p.detail});
  r.filterRect = result.filterRect;
  if (result.prepared) {
    r.preparedConfidence = result.prepared->confidence;
    r.preparedFound = result.prepared->FoundPhoto();
    r.preparedAngle = result.prepared->angle;
    for (size_t k = 0; k < 4; ++k)
      r.preparedCorners[k] = {static_cast<int32_t>(result.prepared->corners[k].x),
                              static_cast<int32_t>(result.prepared->corners[k].y)};
  }
  r.prepareMs = result.prepareSeconds * 1e3;
  r.refineMs = result.refineSeconds * 1e3;
  return r;
}

PhotoOutline OutlineFromRefined(const RefinedAnswer& refined, bool picture) {
  const auto& points = picture ? refined.picture : refined.outline;
  Refine::Quad q{};
  for (size_t k = 0; k < 4; ++k) q[k] = {points[k].x, points[k].y};
  // The outline runs between pixels; the tool's corners are the outermost
  // pixels themselves, half a pixel in from every side.
  if (auto sides = Refine::SidesOf(q)) {
    for (auto& side : *sides) {
      const Refine::Vec2 inward{-side.direction.y, side.direction.x};
      side.point = side.point + inward * 0.5;
    }
    if (auto inset = Refine::CornersOf(*sides)) q = *inset;
  }
  PhotoOutline outline;
  for (size_t k = 0; k < 4; ++k)
    outline.corners[k] = {static_cast<int32_t>(std::lround(q[k].x)),
                          static_cast<int32_t>(std::lround(q[k].y))};
  outline.angle = refined.angle;
  return outline;
}

}  // namespace Fringe
