// Median-of-slopes start and Tukey-biweight re-weighting.
#include "refine/line_fit.h"

#include <algorithm>
#include <cmath>
#include <vector>

namespace Refine {
namespace {

double Median(std::vector<double>& values) {
  const size_t mid = values.size() / 2;
  std::nth_element(values.begin(), values.begin() + static_cast<std::ptrdiff_t>(mid), values.end());
  double m = values[mid];
  if (values.size() % 2 == 0) {
    const double below =
        *std::max_element(values.begin(), values.begin() + static_cast<std::ptrdiff_t>(mid));
    m = 0.5 * (m + below);
  }
  return m;
}

}  // namespace

LineFitResult FitLineRobust(std::span<const FitSample> samples, const RobustFitOptions& options) {
  LineFitResult result;
  const size_t n = samples.size();
  if (n < static_cast<size_t>(std::max(options.minInliers, 2))) return result;

  // Start: median slope over far-apart pairs, then the median offset.
  std::vector<double> scratch;
  scratch.reserve(n);
  const size_t half = n / 2;
  for (size_t i = 0; i + half < n; ++i) {
    const FitSample& a = samples[i];
    const FitSample& b = samples[i + half];
    const double dt = b.t - a.t;
    if (std::abs(dt) > 1e-9) scratch.push_back((b.s - a.s) / dt);
  }
  if (scratch.empty()) return result;
  double slope = Median(scratch);
  scratch.clear();
  for (const FitSample& p : samples) scratch.push_back(p.s - slope * p.t);
  double offset = Median(scratch);

  std::vector<double> residual(n);
  double scale = options.minScale;
  for (int iteration = 0; iteration < options.iterations; ++iteration) {
    scratch.clear();
    for (size_t i = 0; i < n; ++i) {
      residual[i] = samples[i].s - (offset + slope * samples[i].t);
      scratch.push_back(std::abs(residual[i]));
    }
    scale = std::max(1.4826 * Median(scratch), options.minScale);
    const double cutoff = options.tukeyConstant * scale;

    // Weighted least squares about the weighted mean of t.
    double sw = 0.0, st = 0.0, ss = 0.0;
    std::vector<double> w(n, 0.0);
    for (size_t i = 0; i < n; ++i) {
      const double u = residual[i] / cutoff;
      if (std::abs(u) >= 1.0) continue;
      const double biweight = (1.0 - u * u) * (1.0 - u * u);
      w[i] = biweight * samples[i].weight;
      sw += w[i];
      st += w[i] * samples[i].t;
      ss += w[i] * samples[i].s;
    }
    if (!(sw > 0.0)) return result;
    const double tm = st / sw;
    const double sm = ss / sw;
    double stt = 0.0, sts = 0.0;
    for (size_t i = 0; i < n; ++i) {
      if (w[i] == 0.0) continue;
      const double dt = samples[i].t - tm;
      stt += w[i] * dt * dt;
      sts += w[i] * dt * (samples[i].s - sm);
    }
    if (!(stt > 0.0)) return result;
    const double newSlope = sts / stt;
    const double newOffset = sm - newSlope * tm;
    const bool settled = std::abs(newSlope - slope) * (std::abs(tm) + 1.0) < 1e-4 &&
                         std::abs(newOffset - offset) < 1e-4;
    slope = newSlope;
    offset = newOffset;
    if (settled) break;
  }

  // Inliers and their spread about the final line.
  const double cutoff = options.tukeyConstant * scale;
  double sw = 0.0, sr = 0.0;
  int inliers = 0;
  for (const FitSample& p : samples) {
    const double r = p.s - (offset + slope * p.t);
    if (std::abs(r) >= cutoff) continue;
    ++inliers;
    sw += p.weight;
    sr += p.weight * r * r;
  }
  if (inliers < options.minInliers || !(sw > 0.0)) return result;
  result.ok = true;
  result.offset = offset;
  result.slope = slope;
  result.scale = scale;
  result.inliers = inliers;
  result.rms = std::sqrt(sr / sw);
  return result;
}

}  // namespace Refine
