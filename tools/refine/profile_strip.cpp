// Sampling of profiles across a side.
#include "refine/profile_strip.h"

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
  const double scale = 1.0 / (2 * half + 1);
  for (int line = 0; line < strip.lines; ++line) {
    float* out = strip.values.data() + static_cast<size_t>(line) * static_cast<size_t>(width);
    for (int k = 0; k < width; ++k) {
      const double s = sFrom + sStep * k;
      double sum = 0.0;
      bool ok = true;
      for (int m = -half; m <= half && ok; ++m) {
        const Vec2 p = frame.At(t[static_cast<size_t>(line)] + m, s);
        double v = 0.0;
        ok = area.Contains(p) && sampler.Sample(p.x, p.y, v);
        sum += v;
      }
      if (ok) out[k] = static_cast<float>(sum * scale);
    }
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
