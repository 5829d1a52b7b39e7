// RunAnalysis: the first half (profiles, centre, class, edge map) over the
// whole page, then, unless the page is flat, the outline, angle and box.
#include "filter/analysis/driver.h"

#include <algorithm>
#include <cstdint>

#include "filter/analysis/angle.h"
#include "filter/analysis/box_fit.h"
#include "filter/analysis/classification.h"
#include "filter/analysis/corner_snap.h"
#include "filter/analysis/double_list.h"
#include "filter/analysis/edge_map.h"
#include "filter/analysis/edge_points.h"
#include "filter/analysis/frame_check.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/geometry.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/numeric.h"
#include "filter/analysis/profiles.h"
#include "filter/analysis/records.h"

namespace Project {
namespace {

constexpr int16_t kMinFrameSide = 27;
constexpr int16_t kInset = 9;
constexpr int32_t kAngleBins = 180;
constexpr int16_t kNoConfidence = 0;
constexpr int16_t kWholePageConfidence = 127;
constexpr int16_t kFoundConfidence = 255;

// The second half: outline points, angle, upright box, corners turned back
// and rounded into the result. False when a stage fails.
bool FindPhotoCorners(const StageSet& stages, const FrameView& frame, AnalysisHost& host,
                      Rect search, const Rect& image, const PointD& centre,
                      const AnalysisParams& params, ProgressCounter& progress,
                      AnalysisResult& result) {
  DoubleList xs;
  DoubleList ys;
  ClipRect(search, image);
  if (!stages.findEdgePoints(frame, host, search, xs, ys, progress)) return false;
  if (!stages.estimateAngle(xs, ys, kAngleBins, result.angle)) return false;
  StraightenPoints(xs, ys, result.angle, centre);
  BoxCorners box;
  if (!stages.fitBox(xs, ys, box, params)) return false;
  GrowQuad(box, -1.0, -1.0);
  for (PointD& corner : box) RotatePoint(corner, result.angle * kRadiansPerDegree, centre);
  RoundCorners(box, result.corners);
  result.confidence = kFoundConfidence;
  return true;
}

}  // namespace

AnalysisParams MakeAnalysisParams(int16_t width, int16_t height) {
  AnalysisParams params;
  params.minCount = TruncToInt32(static_cast<double>(std::min(width, height)) * 0.15);
  return params;
}

const StageSet& ModuleStages() {
  static constexpr StageSet kStages{ComputeProfiles, BuildEdgeMap, FindEdgePoints, EstimateAngle,
                                    FitBox};
  return kStages;
}

void RunAnalysis(const FrameView& frame, AnalysisHost& host, AnalysisResult& result) {
  RunAnalysisWith(ModuleStages(), frame, host, result);
}

void RunAnalysisWith(const StageSet& stages, const FrameView& frame, AnalysisHost& host,
                     AnalysisResult& result) {
  const int16_t width = FrameWidth(frame);
  const int16_t height = FrameHeight(frame);
  const AnalysisParams params = MakeAnalysisParams(width, height);
  if (width < kMinFrameSide || height < kMinFrameSide) {
    host.WriteEmptyFringeRecord();
    return;
  }
  if (CheckFrame(frame) != FrameProblem::kNone) {
    host.WriteEmptyFringeRecord();
    return;
  }

  ProgressCounter progress;
  progress.total = 2 * (width + 2 * height) - 33;
  TakeProgressStep(progress, host);

  const Rect image{0, 0, frame.documentRows, frame.documentColumns};
  Rect search{kInset, kInset, static_cast<int16_t>(height - kInset),
              static_cast<int16_t>(width - kInset)};
  ClipRect(search, image);
  TakeProgressStep(progress, host);

  DoubleList columns;
  DoubleList rows;
  if (!AllocList(columns, width) || !AllocList(rows, height)) {
    host.WriteEmptyFringeRecord();
    return;
  }
  TakeProgressStep(progress, host);

  stages.computeProfiles(frame, host, columns, rows, progress);
  TakeProgressStep(progress, host);
  const PointD centre{ProfileCentroid(columns), ProfileCentroid(rows)};
  const PositionClass position = ClassifyPosition(columns, rows, params.flatnessThreshold);
  TakeProgressStep(progress, host);
  stages.buildEdgeMap(frame, host, params.edgeThreshold, progress);
  TakeProgressStep(progress, host);

  switch (position) {
    case kUndecided:
    case kFlat:
      FullImageCorners(result.corners, image);
      result.confidence = kNoConfidence;
      break;
    case kFull:
      FullImageCorners(result.corners, image);
      result.confidence = kWholePageConfidence;
      break;
    case kTouching:
    case kInside:
      break;
  }
  if (position != kFlat &&
      !FindPhotoCorners(stages, frame, host, search, image, centre, params, progress, result)) {
    host.WriteEmptyFringeRecord();
    return;
  }

  SnapCorners(result.corners, image);
  OffsetCorners(result.corners, frame.inRect.left, frame.inRect.top);
  host.WriteFringeRecord(result.corners, result.confidence);
  TakeProgressStep(progress, host);
}

}  // namespace Project
