// Deterministic random sources for the page generator: a 64-bit generator,
// bell-shaped noise from it, and smooth value noise on a coarse grid. Only
// integer arithmetic and basic floating-point operations are used, so a page
// comes out byte for byte the same on every platform.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

namespace Synth {

// splitmix64: small, fast, and good enough for textures and noise.
class Random {
 public:
  explicit Random(uint64_t seed) : state_(seed) {}

  uint64_t Next() {
    state_ += 0x9E3779B97F4A7C15ULL;
    uint64_t z = state_;
    z = (z ^ (z >> 30U)) * 0xBF58476D1CE4E5B9ULL;
    z = (z ^ (z >> 27U)) * 0x94D049BB133111EBULL;
    return z ^ (z >> 31U);
  }

  // Uniform in [-1, 1].
  double Signed() { return static_cast<double>(Next() >> 11U) * (2.0 / 9007199254740992.0) - 1.0; }

  // Mean 0, standard deviation 1, from the sum of four 16-bit uniforms
  // (an Irwin-Hall bell: close enough to Gaussian for sensor noise).
  double Bell() {
    const uint64_t r = Next();
    const uint64_t sum =
        (r & 0xFFFFU) + ((r >> 16U) & 0xFFFFU) + ((r >> 32U) & 0xFFFFU) + (r >> 48U);
    // Four uniforms on [0, 65535]: mean 131070, variance 4 * 65536^2 / 12.
    return (static_cast<double>(sum) - 131070.0) * (1.7320508075688772 / 65536.0);
  }

 private:
  uint64_t state_;
};

// Smooth noise in [-1, 1]: random values on a square grid of the given cell
// size, blended with a smoothstep between grid points.
class ValueNoise {
 public:
  ValueNoise(double width, double height, double cell, Random& random);

  double At(double x, double y) const;

  // The values at (0.5, y), (1.5, y), ... for count pixels of one row, the
  // same as At would give, with the vertical blend done once per grid column.
  void FillRow(double y, int count, double* out) const;

 private:
  double inverseCell_;
  std::size_t columns_;
  std::size_t rows_;
  std::vector<double> grid_;
  mutable std::vector<double> blended_;  // scratch of FillRow
};

}  // namespace Synth
