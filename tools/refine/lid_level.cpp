// Block statistics, a robust quadratic surface through the calm blocks, and
// the division by it.
#include "refine/lid_level.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdlib>

namespace Refine {
namespace {

constexpr int kBlock = 16;
constexpr double kWhite = 245.0;

struct Block {
  double u = 0.0, v = 0.0;  // centre, as fractions of the page
  double median = 0.0;
  double noise = 0.0;
};

double Nth(std::vector<double>& v, double p) {
  const auto k = static_cast<size_t>(std::clamp(p, 0.0, 1.0) * static_cast<double>(v.size() - 1));
  std::nth_element(v.begin(), v.begin() + static_cast<std::ptrdiff_t>(k), v.end());
  return v[k];
}

std::array<double, 6> Terms(double u, double v) {
  return {1.0, u, v, u * u, u * v, v * v};
}

double Evaluate(const std::array<double, 6>& c, double u, double v) {
  const auto t = Terms(u, v);
  double s = 0.0;
  for (size_t i = 0; i < 6; ++i) s += c[i] * t[i];
  return s;
}

// Weighted least squares of the six terms, by Gaussian elimination.
bool FitSurface(const std::vector<Block>& blocks, const std::vector<double>& weight,
                std::array<double, 6>& c) {
  double a[6][7] = {};
  for (size_t b = 0; b < blocks.size(); ++b) {
    if (weight[b] <= 0.0) continue;
    const auto t = Terms(blocks[b].u, blocks[b].v);
    for (size_t i = 0; i < 6; ++i) {
      for (size_t j = 0; j < 6; ++j) a[i][j] += weight[b] * t[i] * t[j];
      a[i][6] += weight[b] * t[i] * blocks[b].median;
    }
  }
  for (size_t col = 0; col < 6; ++col) {
    size_t pivot = col;
    for (size_t r = col + 1; r < 6; ++r)
      if (std::abs(a[r][col]) > std::abs(a[pivot][col])) pivot = r;
    if (std::abs(a[pivot][col]) < 1e-9) return false;
    for (size_t j = 0; j < 7; ++j) std::swap(a[col][j], a[pivot][j]);
    for (size_t r = 0; r < 6; ++r) {
      if (r == col) continue;
      const double f = a[r][col] / a[col][col];
      for (size_t j = col; j < 7; ++j) a[r][j] -= f * a[col][j];
    }
  }
  for (size_t i = 0; i < 6; ++i) c[i] = a[i][6] / a[i][i];
  return true;
}

// The median of values 0 ... 765 counted in a histogram.
int HistogramMedian(const std::array<uint16_t, 766>& counts, int total) {
  int seen = 0;
  for (int v = 0; v < 766; ++v) {
    seen += counts[static_cast<size_t>(v)];
    if (2 * seen > total) return v;
  }
  return 765;
}

// A pixel's channel sum, gray pages counted three times, so that one scale
// (0 ... 765) serves both.
int Sum3(const PageImage& page, int x, int y) {
  const uint8_t* p = page.pixels + static_cast<std::ptrdiff_t>(y) * page.rowBytes +
                     static_cast<std::ptrdiff_t>(x) * page.pixelBytes;
  return page.channels == 1 ? 3 * p[0] : p[0] + p[1] + p[2];
}

}  // namespace

LidEstimate EstimateLid(const PageImage& page) {
  LidEstimate out;
  if (!CheckPageImage(page).empty() || page.width < 2 * kBlock || page.height < 2 * kBlock)
    return out;
  const int across = std::clamp(page.width / 120, 4, 16);
  const int down = std::clamp(page.height / 120, 4, 16);
  std::vector<Block> blocks;
  std::array<uint16_t, 766> values{};
  std::array<uint16_t, 766> steps{};
  for (int by = 0; by < down; ++by) {
    for (int bx = 0; bx < across; ++bx) {
      const int x0 = static_cast<int>((bx + 0.5) * page.width / across) - kBlock / 2;
      const int y0 = static_cast<int>((by + 0.5) * page.height / down) - kBlock / 2;
      values.fill(0);
      steps.fill(0);
      for (int y = y0; y < y0 + kBlock; ++y) {
        int previous = Sum3(page, x0, y);
        ++values[static_cast<size_t>(previous)];
        for (int x = x0 + 1; x < x0 + kBlock; ++x) {
          const int v = Sum3(page, x, y);
          ++values[static_cast<size_t>(v)];
          ++steps[static_cast<size_t>(std::abs(v - previous))];
          previous = v;
        }
      }
      Block b;
      b.u = (x0 + kBlock * 0.5) / page.width;
      b.v = (y0 + kBlock * 0.5) / page.height;
      b.median = HistogramMedian(values, kBlock * kBlock) / 3.0;
      // Median |difference| of two neighbours is 0.954 sigma; rounding to
      // whole gray levels leaves a floor of about a quarter level.
      b.noise = std::max(HistogramMedian(steps, kBlock * (kBlock - 1)) / 3.0 / 0.954, 0.25);
      blocks.push_back(b);
    }
  }
  std::vector<double> noises;
  for (const Block& b : blocks) noises.push_back(b.noise);
  out.noise = Nth(noises, 0.2);

  // Calm blocks, brighter ones first: the lid, and perhaps calm parts of a photo.
  std::vector<double> weight(blocks.size(), 0.0);
  std::vector<double> levels;
  for (size_t i = 0; i < blocks.size(); ++i) {
    if (blocks[i].noise <= 1.5 * out.noise + 1.5) {
      weight[i] = 1.0;
      levels.push_back(blocks[i].median);
    }
  }
  if (levels.size() < 8) return out;
  out.level = Nth(levels, 0.65);
  // Start flat at that level, then fit, dropping blocks well below the surface
  // (photos are darker than the lid they lie on).
  out.surface = {out.level, 0.0, 0.0, 0.0, 0.0, 0.0};
  for (int round = 0; round < 4; ++round) {
    std::vector<double> residual;
    for (size_t i = 0; i < blocks.size(); ++i)
      if (weight[i] > 0.0)
        residual.push_back(
            std::abs(blocks[i].median - Evaluate(out.surface, blocks[i].u, blocks[i].v)));
    const double scale = std::max(3.0, 1.4826 * Nth(residual, 0.5));
    for (size_t i = 0; i < blocks.size(); ++i) {
      if (blocks[i].noise > 1.5 * out.noise + 1.5) continue;
      weight[i] = std::abs(blocks[i].median - Evaluate(out.surface, blocks[i].u, blocks[i].v)) <=
                          3.0 * scale
                      ? 1.0
                      : 0.0;
    }
    if (std::count_if(weight.begin(), weight.end(), [](double w) { return w > 0.0; }) < 8) break;
    std::array<double, 6> fitted{};
    if (!FitSurface(blocks, weight, fitted)) break;
    out.surface = fitted;
  }
  std::vector<double> residual;
  for (size_t i = 0; i < blocks.size(); ++i)
    if (weight[i] > 0.0)
      residual.push_back(
          std::abs(blocks[i].median - Evaluate(out.surface, blocks[i].u, blocks[i].v)));
  out.residual = residual.empty() ? 0.0 : 1.4826 * Nth(residual, 0.5);
  double lo = 1e9, hi = -1e9;
  for (int i = 0; i <= 8; ++i) {
    for (int j = 0; j <= 8; ++j) {
      const double s = Evaluate(out.surface, i / 8.0, j / 8.0);
      lo = std::min(lo, s);
      hi = std::max(hi, s);
    }
  }
  out.spread = hi - lo;
  return out;
}

double LidAt(const LidEstimate& lid, double u, double v) {
  return Evaluate(lid.surface, std::clamp(u, 0.0, 1.0), std::clamp(v, 0.0, 1.0));
}

bool NeedsLevelling(double level, double spread) {
  return level < 150.0 || spread > 60.0;
}

void LevelLid(std::vector<uint8_t>& pixels, int width, int height, int channels) {
  const PageImage view{width,    height,        channels,
                       channels, pixels.data(), static_cast<std::ptrdiff_t>(width) * channels};
  const LidEstimate lid = EstimateLid(view);
  if (lid.level <= 0.0) return;
  for (int y = 0; y < height; ++y) {
    uint8_t* row = pixels.data() + static_cast<size_t>(y) * static_cast<size_t>(width) *
                                       static_cast<size_t>(channels);
    const double v = (y + 0.5) / height;
    for (int x = 0; x < width; ++x) {
      const double surface = std::max(16.0, Evaluate(lid.surface, (x + 0.5) / width, v));
      const double gain = kWhite / surface;
      for (int c = 0; c < channels; ++c) {
        const double value = row[x * channels + c] * gain;
        row[x * channels + c] = static_cast<uint8_t>(std::min(255.0, value + 0.5));
      }
    }
  }
}

}  // namespace Refine
