// Half-pixel profiles, steepest point of the expected polarity, parabola.
#include "refine/edge_locate.h"

#include <algorithm>
#include <cmath>

namespace Refine {

std::vector<FitSample> LocateEdges(const GraySampler& sampler, const SampleArea& area,
                                   const SideFrame& frame, const std::vector<double>& t,
                                   const LocateRequest& request) {
  constexpr double kStep = 0.5;
  const int reach = static_cast<int>(std::ceil((request.window + 2.0) / kStep));
  const int count = 2 * reach + 1;
  const int half = request.smear / 2;
  const double scale = 1.0 / (2 * half + 1);
  std::vector<double> values(static_cast<size_t>(count));
  std::vector<double> slope(static_cast<size_t>(count));
  std::vector<FitSample> found;
  found.reserve(t.size());

  for (const double at : t) {
    const double expected = request.offset + request.slope * (at - request.tCentre);
    bool ok = true;
    std::fill(values.begin(), values.end(), 0.0);
    for (int m = -half; m <= half && ok; ++m) {
      const Vec2 first = frame.At(at + m, expected - reach * kStep);
      const Vec2 last = frame.At(at + m, expected + reach * kStep);
      // The run is straight: both ends inside means every point inside.
      ok = area.Contains(first) && area.Contains(last) && sampler.Inside(first.x, first.y) &&
           sampler.Inside(last.x, last.y);
      const Vec2 step = frame.outward * kStep;
      for (int i = 0; i < count && ok; ++i) {
        const Vec2 p = first + step * i;
        values[static_cast<size_t>(i)] += sampler.SampleInside(p.x, p.y) * scale;
      }
    }
    if (!ok) continue;
    // Slope over one pixel, signed so that the expected step is positive.
    int best = -1;
    double bestValue = request.minGradient;
    for (int i = 1; i + 1 < count; ++i) {
      slope[static_cast<size_t>(i)] = request.polarity * (values[static_cast<size_t>(i + 1)] -
                                                          values[static_cast<size_t>(i - 1)]);
      if (std::abs(i - reach) * kStep > request.window) continue;
      if (slope[static_cast<size_t>(i)] > bestValue) {
        bestValue = slope[static_cast<size_t>(i)];
        best = i;
      }
    }
    if (best < 2 || best > count - 3) continue;
    const double a = slope[static_cast<size_t>(best - 1)];
    const double b = slope[static_cast<size_t>(best)];
    const double c = slope[static_cast<size_t>(best + 1)];
    double shift = 0.0;
    const double denom = a - 2.0 * b + c;
    if (denom < 0.0) shift = 0.5 * (a - c) / denom;
    if (std::abs(shift) > 0.5) continue;
    found.push_back({at, expected + (best - reach + shift) * kStep, bestValue});
  }
  return found;
}

}  // namespace Refine
