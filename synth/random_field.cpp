// Smooth value noise for paper and photo textures.
#include "synth/random_field.h"

#include <algorithm>
#include <cmath>

namespace Synth {

ValueNoise::ValueNoise(double width, double height, double cell, Random& random)
    : inverseCell_(1.0 / cell),
      columns_(static_cast<std::size_t>(std::max(0.0, width) / cell) + 2),
      rows_(static_cast<std::size_t>(std::max(0.0, height) / cell) + 2),
      grid_(columns_ * rows_) {
  for (double& value : grid_) value = random.Signed();
}

double ValueNoise::At(double x, double y) const {
  const double gx = std::clamp(x * inverseCell_, 0.0, static_cast<double>(columns_ - 1));
  const double gy = std::clamp(y * inverseCell_, 0.0, static_cast<double>(rows_ - 1));
  const auto ix = std::min(static_cast<std::size_t>(gx), columns_ - 2);
  const auto iy = std::min(static_cast<std::size_t>(gy), rows_ - 2);
  double fx = gx - static_cast<double>(ix);
  double fy = gy - static_cast<double>(iy);
  fx = fx * fx * (3.0 - 2.0 * fx);
  fy = fy * fy * (3.0 - 2.0 * fy);
  const double* top = &grid_[iy * columns_ + ix];
  const double* bottom = top + columns_;
  const double upper = top[0] + (top[1] - top[0]) * fx;
  const double lower = bottom[0] + (bottom[1] - bottom[0]) * fx;
  return upper + (lower - upper) * fy;
}

void ValueNoise::FillRow(double y, int count, double* out) const {
  const double gy = std::clamp(y * inverseCell_, 0.0, static_cast<double>(rows_ - 1));
  const auto iy = std::min(static_cast<std::size_t>(gy), rows_ - 2);
  double fy = gy - static_cast<double>(iy);
  fy = fy * fy * (3.0 - 2.0 * fy);
  blended_.resize(columns_);
  const double* top = &grid_[iy * columns_];
  const double* bottom = top + columns_;
  for (std::size_t c = 0; c < columns_; ++c) blended_[c] = top[c] + (bottom[c] - top[c]) * fy;
  for (int x = 0; x < count; ++x) {
    const double gx = std::clamp((x + 0.5) * inverseCell_, 0.0, static_cast<double>(columns_ - 1));
    const auto ix = std::min(static_cast<std::size_t>(gx), columns_ - 2);
    double fx = gx - static_cast<double>(ix);
    fx = fx * fx * (3.0 - 2.0 * fx);
    out[x] = blended_[ix] + (blended_[ix + 1] - blended_[ix]) * fx;
  }
}

}  // namespace Synth
