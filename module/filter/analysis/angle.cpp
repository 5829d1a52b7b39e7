// LocalDirection and EstimateAngle.
#include "filter/analysis/angle.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

#include "filter/analysis/allocation.h"
#include "filter/analysis/numeric.h"

namespace Project {
namespace {

constexpr double kDegreesPerRadian = 57.29577951;
constexpr int32_t kMinPoints = 6;
constexpr int32_t kMinWindow = 4;

double FoldToQuarterTurn(double a) {
  if (a > 90.0) {
    a -= 180.0;
  } else if (a < -90.0) {
    a += 180.0;
  }
  if (a > 45.0) {
    a -= 90.0;
  } else if (a < -45.0) {
    a += 90.0;
  }
  return a;
}

double BinCentre(int32_t j, int32_t bins) {
  return static_cast<double>(j) * 90.0 / static_cast<double>(bins) - 45.0;
}

}  // namespace

double LocalDirection(const DoubleList& xs, const DoubleList& ys, int32_t i, uint32_t w) {
  if (w < 2) return 0.0;
  const int64_t n = xs.count;
  const int64_t first = static_cast<int64_t>(i) - static_cast<int64_t>(w / 2);
  const int64_t stop = first + static_cast<int64_t>(w);
  if (first >= stop) return 0.0;

  double sumX = 0.0;
  double sumY = 0.0;
  double sumXX = 0.0;
  double sumXY = 0.0;
  int64_t taken = 0;
  for (int64_t k = first; k < stop; ++k) {
    int64_t j = k;
    if (k < 0) {
      j = k + n;
    } else if (k >= n) {
      j = k - n;
    }
    if (j < 0 || j >= n) continue;
    const double x = xs.data[j];
    const double y = ys.data[j];
    sumX += x;
    sumY += y;
    sumXX += x * x;
    sumXY += x * y;
    ++taken;
  }
  if (taken < 1) return 0.0;
  const double c = static_cast<double>(taken);
  const double meanX = sumX / c;
  const double meanY = sumY / c;
  return std::atan2(sumXY / c - meanX * meanY, sumXX / c - meanX * meanX) * kDegreesPerRadian;
}

bool EstimateAngle(const DoubleList& xs, const DoubleList& ys, int32_t bins, double& angle) {
  const int32_t n = xs.count;
  if (n != ys.count || n < kMinPoints) {
    angle = 0.0;
    return false;
  }
  if (bins < 1) return false;
  const std::unique_ptr<double[]> histogram =
      AllocateZeroed<double>(static_cast<std::size_t>(bins));
  if (!histogram) return false;

  const auto window = static_cast<uint32_t>(std::max(n / 32, kMinWindow));
  for (int32_t i = 0; i < n; ++i) {
    const double a = FoldToQuarterTurn(LocalDirection(xs, ys, i, window));
    const double position = std::floor((a + 45.0) * static_cast<double>(bins) / 90.0 + 0.5);
    const int32_t bin = TruncToInt32(position);
    if (bin >= 0 && bin < bins) histogram[bin] += 1.0;
  }

  int32_t peak = 0;
  double best = histogram[0];
  for (int32_t j = 1; j < bins; ++j) {
    if (histogram[j] > best) {
      best = histogram[j];
      peak = j;
    }
  }

  const double peakAngle = BinCentre(peak, bins);
  const int32_t low = std::max(peak - 5, 0);
  const int32_t high = std::min(peak + 5, bins);
  double weight = 0.0;
  double moment = 0.0;
  for (int32_t j = low; j < high; ++j) {
    weight += histogram[j];
    moment += BinCentre(j, bins) * histogram[j];
  }
  angle = weight != 0.0 ? -(moment / weight) : -peakAngle;
  return true;
}

}  // namespace Project
