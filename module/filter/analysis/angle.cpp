// LocalDirection and EstimateAngle. The edge search delivers whole-number
// points; for them the window sums slide along the list instead of being
// added afresh for every point.
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

// Whole-number coordinates up to this size keep every window sum of x, y,
// x x and x y exact in a double for windows up to kLargestWholeWindow.
constexpr double kLargestWholeCoordinate = 32768.0;
constexpr uint32_t kLargestWholeWindow = 1U << 22;

bool AllWholeNumbers(const DoubleList& list) {
  for (int32_t k = 0; k < list.count; ++k) {
    const double v = list.data[k];
    if (!(std::abs(v) <= kLargestWholeCoordinate) || v != std::trunc(v)) return false;
  }
  return true;
}

// The window sums of LocalDirection for every centre index at once, for
// whole-number points and a window no longer than the list: each window
// differs from the one before by one point in and one point out, and the
// sums of whole numbers are exact in that order too. Feeds each direction
// to vote(i, direction) in index order.
template <typename Vote>
void SlidingDirections(const DoubleList& xs, const DoubleList& ys, uint32_t w, Vote vote) {
  const int64_t n = xs.count;
  const auto ring = [n](int64_t k) { return k < 0 ? k + n : (k >= n ? k - n : k); };
  const auto x = [&](int64_t k) { return static_cast<int64_t>(xs.data[ring(k)]); };
  const auto y = [&](int64_t k) { return static_cast<int64_t>(ys.data[ring(k)]); };
  const int64_t half = w / 2;
  int64_t sumX = 0;
  int64_t sumY = 0;
  int64_t sumXX = 0;
  int64_t sumXY = 0;
  for (int64_t k = -half; k < -half + static_cast<int64_t>(w); ++k) {
    sumX += x(k);
    sumY += y(k);
    sumXX += x(k) * x(k);
    sumXY += x(k) * y(k);
  }
  const double c = static_cast<double>(w);
  for (int64_t i = 0; i < n; ++i) {
    if (i > 0) {
      const int64_t out = i - 1 - half;
      const int64_t in = out + static_cast<int64_t>(w);
      sumX += x(in) - x(out);
      sumY += y(in) - y(out);
      sumXX += x(in) * x(in) - x(out) * x(out);
      sumXY += x(in) * y(in) - x(out) * y(out);
    }
    const double meanX = static_cast<double>(sumX) / c;
    const double meanY = static_cast<double>(sumY) / c;
    vote(std::atan2(static_cast<double>(sumXY) / c - meanX * meanY,
                    static_cast<double>(sumXX) / c - meanX * meanX) *
         kDegreesPerRadian);
  }
}

double BinCentre(int32_t j, int32_t bins) {
  return static_cast<double>(j) * 90.0 / static_cast<double>(bins) - 45.0;
}

}  // namespace

double FoldToQuarterTurn(double degrees) {
  double a = degrees;
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

int32_t VoteBin(double folded, int32_t bins) {
  return TruncToInt32(std::floor((folded + 45.0) * static_cast<double>(bins) / 90.0 + 0.5));
}

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
  const auto vote = [&](double direction) {
    const int32_t bin = VoteBin(FoldToQuarterTurn(direction), bins);
    if (bin >= 0 && bin < bins) histogram[bin] += 1.0;
  };
  if (window <= static_cast<uint32_t>(n) && window <= kLargestWholeWindow && AllWholeNumbers(xs) &&
      AllWholeNumbers(ys)) {
    SlidingDirections(xs, ys, window, vote);
  } else {
    for (int32_t i = 0; i < n; ++i) vote(LocalDirection(xs, ys, i, window));
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
