// Robust straight-line fit s = offset + slope * t through scattered edge
// positions, tolerant of a large share of outliers (dust, photo detail).
#pragma once

#include <span>

namespace Refine {

struct FitSample {
  double t = 0.0;       // position along the side
  double s = 0.0;       // edge position across the side
  double weight = 1.0;  // confidence of the sample, > 0
};

struct LineFitResult {
  bool ok = false;
  double offset = 0.0;
  double slope = 0.0;
  double rms = 0.0;    // weighted RMS residual of the inliers
  double scale = 0.0;  // robust residual scale the inliers were judged by
  int inliers = 0;
};

struct RobustFitOptions {
  double minScale = 0.25;  // floor of the residual scale, px
  double tukeyConstant = 4.685;
  int iterations = 12;
  int minInliers = 6;
};

// Starts from a median-of-slopes estimate (each sample paired with the one
// half the list away, so the pairs are far apart and the estimate is stable),
// then re-weights with Tukey's biweight. Samples must be sorted by t.
LineFitResult FitLineRobust(std::span<const FitSample> samples,
                            const RobustFitOptions& options = {});

}  // namespace Refine
