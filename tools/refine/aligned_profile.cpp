// Slope search over group means, then the aligned mean and roughness.
#include "refine/aligned_profile.h"

#include <algorithm>
#include <cmath>
#include <limits>

namespace Refine {
namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

double InterpolateLine(const ProfileStrip& strip, int line, double index) {
  if (!(index >= 0.0) || index > strip.width - 1) return kNaN;
  const auto k = static_cast<int>(index);
  const double f = index - k;
  const double a = strip.At(line, k);
  if (f == 0.0) return a;
  const double b = strip.At(line, k + 1);
  return a + (b - a) * f;  // NaN propagates
}

// Score of a candidate alignment: the energy of the steps of the mean.
double StepEnergy(const std::vector<std::vector<double>>& groups,
                  const std::vector<double>& shift) {
  const auto width = static_cast<int>(groups.front().size());
  std::vector<double> mean(static_cast<size_t>(width), kNaN);
  const auto needed = static_cast<size_t>(std::max<size_t>(1, (groups.size() * 3 + 3) / 4));
  for (int k = 0; k < width; ++k) {
    double sum = 0.0;
    size_t n = 0;
    for (size_t g = 0; g < groups.size(); ++g) {
      const double v = Interpolate(groups[g], k + shift[g]);
      if (std::isnan(v)) continue;
      sum += v;
      ++n;
    }
    if (n >= needed) mean[static_cast<size_t>(k)] = sum / static_cast<double>(n);
  }
  double energy = 0.0;
  for (int k = 1; k + 1 < width; ++k) {
    const double d = mean[static_cast<size_t>(k + 1)] - mean[static_cast<size_t>(k - 1)];
    if (!std::isnan(d)) energy += d * d;
  }
  return energy;
}

double MedianOf(std::vector<double>& v) {
  const auto mid = static_cast<std::ptrdiff_t>(v.size() / 2);
  std::nth_element(v.begin(), v.begin() + mid, v.end());
  return v[static_cast<size_t>(mid)];
}

}  // namespace

double Interpolate(const std::vector<double>& values, double index) {
  if (!(index >= 0.0) || index > static_cast<double>(values.size()) - 1.0) return kNaN;
  const auto k = static_cast<size_t>(index);
  const double f = index - static_cast<double>(k);
  if (f == 0.0) return values[k];
  return values[k] + (values[k + 1] - values[k]) * f;
}

AlignedProfile AlignProfiles(const ProfileStrip& strip, double maxSlope) {
  AlignedProfile out;
  out.sFrom = strip.sFrom;
  out.sStep = strip.sStep;
  out.lines = strip.lines;
  const int width = strip.width;
  out.mean.assign(static_cast<size_t>(width), kNaN);
  out.roughness.assign(static_cast<size_t>(width), kNaN);
  if (strip.lines < 2 || width < 3) return out;
  out.tCentre = 0.5 * (strip.t.front() + strip.t.back());
  for (int line = 0; line < strip.lines && !out.areaEnds; ++line)
    out.areaEnds = std::isnan(strip.At(line, width - 1));

  // Groups of neighbouring lines, short enough that a small slope does not
  // blur them: their means, and later their roughness.
  const int groupCount = std::clamp(strip.lines / 4, 1, 12);
  std::vector<int> groupFirst(static_cast<size_t>(groupCount) + 1);
  for (int g = 0; g <= groupCount; ++g)
    groupFirst[static_cast<size_t>(g)] = g * strip.lines / groupCount;
  std::vector<std::vector<double>> groups(static_cast<size_t>(groupCount));
  std::vector<double> sums;
  std::vector<int> counts;
  std::vector<double> groupT(static_cast<size_t>(groupCount), 0.0);
  for (int g = 0; g < groupCount; ++g) {
    const int first = groupFirst[static_cast<size_t>(g)];
    const int last = groupFirst[static_cast<size_t>(g) + 1];
    auto& mean = groups[static_cast<size_t>(g)];
    mean.assign(static_cast<size_t>(width), kNaN);
    // Line by line along the strip's rows; each column still sums its lines in order.
    sums.assign(static_cast<size_t>(width), 0.0);
    counts.assign(static_cast<size_t>(width), 0);
    for (int line = first; line < last; ++line) {
      for (int k = 0; k < width; ++k) {
        const double v = strip.At(line, k);
        if (std::isnan(v)) continue;
        sums[static_cast<size_t>(k)] += v;
        ++counts[static_cast<size_t>(k)];
      }
    }
    for (int k = 0; k < width; ++k) {
      const int n = counts[static_cast<size_t>(k)];
      if (2 * n >= last - first && n > 0)
        mean[static_cast<size_t>(k)] = sums[static_cast<size_t>(k)] / n;
    }
    groupT[static_cast<size_t>(g)] =
        0.5 * (strip.t[static_cast<size_t>(first)] + strip.t[static_cast<size_t>(last - 1)]);
  }

  // Slope search: structures at s = s0 + b (t - tCentre) appear in group g at
  // index k + b (t_g - tCentre) / step.
  double bestSlope = 0.0;
  std::vector<double> shift(static_cast<size_t>(groupCount), 0.0);
  if (groupCount >= 3 && maxSlope > 0.0) {
    constexpr int kSteps = 3;
    std::vector<double> scores;
    for (int i = -kSteps; i <= kSteps; ++i) {
      const double b = maxSlope * i / kSteps;
      for (int g = 0; g < groupCount; ++g)
        shift[static_cast<size_t>(g)] =
            b * (groupT[static_cast<size_t>(g)] - out.tCentre) / strip.sStep;
      scores.push_back(StepEnergy(groups, shift));
    }
    const auto best =
        static_cast<int>(std::max_element(scores.begin(), scores.end()) - scores.begin());
    double refine = 0.0;
    if (best > 0 && best + 1 < static_cast<int>(scores.size())) {
      const double a = scores[static_cast<size_t>(best - 1)];
      const double c = scores[static_cast<size_t>(best)];
      const double e = scores[static_cast<size_t>(best + 1)];
      const double denom = a - 2.0 * c + e;
      if (denom < 0.0) refine = std::clamp(0.5 * (a - e) / denom, -0.5, 0.5);
    }
    bestSlope = maxSlope * (best - kSteps + refine) / kSteps;
  }
  out.slope = bestSlope;
  for (int g = 0; g < groupCount; ++g)
    shift[static_cast<size_t>(g)] =
        bestSlope * (groupT[static_cast<size_t>(g)] - out.tCentre) / strip.sStep;

  // Roughness of each group: the mean |difference| between its neighbouring
  // lines, each line lined up with the structures.
  std::vector<std::vector<double>> groupRough(static_cast<size_t>(groupCount));
  std::vector<double> previous;
  for (int g = 0; g < groupCount; ++g) {
    const int first = groupFirst[static_cast<size_t>(g)];
    const int last = groupFirst[static_cast<size_t>(g) + 1];
    auto& rough = groupRough[static_cast<size_t>(g)];
    rough.assign(static_cast<size_t>(width), kNaN);
    if (last - first < 2) continue;
    sums.assign(static_cast<size_t>(width), 0.0);
    counts.assign(static_cast<size_t>(width), 0);
    previous.assign(static_cast<size_t>(width), kNaN);
    for (int line = first; line < last; ++line) {
      const double lineShift =
          bestSlope * (strip.t[static_cast<size_t>(line)] - out.tCentre) / strip.sStep;
      for (int k = 0; k < width; ++k) {
        const double v = InterpolateLine(strip, line, k + lineShift);
        double& before = previous[static_cast<size_t>(k)];
        if (!std::isnan(v) && !std::isnan(before)) {
          sums[static_cast<size_t>(k)] += std::abs(v - before);
          ++counts[static_cast<size_t>(k)];
        }
        before = v;
      }
    }
    for (int k = 0; k < width; ++k) {
      const int n = counts[static_cast<size_t>(k)];
      // For two values with independent noise sigma, E|difference| = 1.128 sigma.
      if (n > 0) rough[static_cast<size_t>(k)] = sums[static_cast<size_t>(k)] / n / 1.128;
    }
  }

  // The typical profile: medians over the groups, so that dust, hairs and
  // specks on a few lines leave it alone.
  std::vector<double> values, roughs;
  for (int k = 0; k < width; ++k) {
    values.clear();
    roughs.clear();
    for (int g = 0; g < groupCount; ++g) {
      const double v =
          Interpolate(groups[static_cast<size_t>(g)], k + shift[static_cast<size_t>(g)]);
      if (!std::isnan(v)) values.push_back(v);
      const double r = groupRough[static_cast<size_t>(g)][static_cast<size_t>(k)];
      if (!std::isnan(r)) roughs.push_back(r);
    }
    // Every group or none: where some lines have run off the page the median
    // of the rest would step for no reason on the page.
    if (static_cast<int>(values.size()) < groupCount) continue;
    out.mean[static_cast<size_t>(k)] = MedianOf(values);
    if (!roughs.empty()) out.roughness[static_cast<size_t>(k)] = MedianOf(roughs);
  }

  // Noise: the calmest stretch of roughness.
  double calmest = std::numeric_limits<double>::infinity();
  for (int k = 2; k + 2 < width; ++k) {
    double s = 0.0;
    int n = 0;
    for (int m = -2; m <= 2; ++m) {
      const double r = out.roughness[static_cast<size_t>(k + m)];
      if (!std::isnan(r)) {
        s += r;
        ++n;
      }
    }
    if (n == 5) calmest = std::min(calmest, s / n);
  }
  // Flat stretches of a compressed page show no noise at all; the gray
  // values' own rounding and the encoder's ringing still scatter them.
  constexpr double kNoiseFloor = 0.7;
  out.noise = std::isfinite(calmest) ? std::max(calmest, kNoiseFloor) : 0.0;
  return out;
}

}  // namespace Refine
