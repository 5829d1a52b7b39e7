// Sampling of profiles across a side.
#include "refine/profile_strip.h"

#include <algorithm>
#include <limits>

namespace Refine {

ProfileStrip SampleStrip(const GraySampler& sampler, const SampleArea& area, const SideFrame& frame,
                         std::span<const double> t, double sFrom, double sStep, int width,
                         int smear) {
  ProfileStrip strip;
  strip.lines = static_cast<int>(t.size());
  strip.width = width;
  strip.sFrom = sFrom;
  strip.sStep = sStep;
  strip.t.assign(t.begin(), t.end());
  strip.values.assign(static_cast<size_t>(strip.lines) * static_cast<size_t>(width),
                      std::numeric_limits<float>::quiet_NaN());
  const int half = smear / 2;
  const float scale = 1.0f / static_cast<float>(2 * half + 1);
  std::vector<double> sum(static_cast<size_t>(width));
  std::vector<char> ok(static_cast<size_t>(width));
  for (int line = 0; line < strip.lines; ++line) {
    std::fill(sum.begin(), sum.end(), 0.0);
    std::fill(ok.begin(), ok.end(), 1);
    for (int m = -half; m <= half; ++m) {
      const double along = t[static_cast<size_t>(line)] + m;
      const Vec2 first = frame.At(along, sFrom);
      const Vec2 last = frame.At(along, sFrom + sStep * (width - 1));
      const Vec2 step = frame.outward * sStep;
      // A straight run with both ends inside the area and the page lies
      // wholly inside: no test per value.
      const bool inside = area.Contains(first) && area.Contains(last) &&
                          sampler.Inside(first.x, first.y) && sampler.Inside(last.x, last.y);
      for (int k = 0; k < width; ++k) {
        const Vec2 p = first + step * k;
        double v = 0.0;
        if (inside) {
          v = sampler.SampleInside(p.x, p.y);
        } else if (!area.Contains(p) || !sampler.Sample(p.x, p.y, v)) {
          ok[static_cast<size_t>(k)] = 0;
        }
        sum[static_cast<size_t>(k)] += v;
      }
    }
    float* out = strip.values.data() + static_cast<size_t>(line) * static_cast<size_t>(width);
    for (int k = 0; k < width; ++k)
      if (ok[static_cast<size_t>(k)])
        out[k] = static_cast<float>(sum[static_cast<size_t>(k)]) * scale;
  }
  return strip;
}

std::vector<double> SpreadPositions(double from, double to, int count) {
  std::vector<double> positions;
  if (count < 1 || !(to > from)) return positions;
  const double step = (to - from) / count;
  for (int i = 0; i < count; ++i) positions.push_back(from + step * (i + 0.5));
  return positions;
}

}  // namespace Refine
