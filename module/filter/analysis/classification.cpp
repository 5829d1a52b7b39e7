// ProfileExtent, ProfileSpread and ClassifyPosition.
#include "filter/analysis/classification.h"

#include <cmath>

namespace Project {
namespace {

constexpr int32_t kInnerMargin = 9;
constexpr int32_t kSmallestMeasured = 28;
constexpr double kBorderMargin = 11.0;

// -1 at the near border, +1 at the far border, 0 inside.
int BorderClass(double value, int32_t entries) {
  if (value <= kBorderMargin) return -1;
  if (value >= static_cast<double>(entries) - kBorderMargin) return 1;
  return 0;
}

}  // namespace

void ProfileExtent(const DoubleList& profile, double& start, double& end) {
  const int32_t n = profile.count;
  if (n < 3) return;
  if (n < kSmallestMeasured) {
    start = 0.0;
    end = 0.0;
    return;
  }
  const int32_t first = kInnerMargin;
  const int32_t last = n - 1 - kInnerMargin;
  double sum = 0.0;
  for (int32_t i = first; i <= last; ++i) sum += profile.data[i];
  const double mean = sum / static_cast<double>(n - 2 * kInnerMargin);

  int32_t lowest = -1;
  int32_t highest = -1;
  int32_t above = 0;
  for (int32_t i = first; i <= last; ++i) {
    if (profile.data[i] > mean) {
      if (lowest < 0) lowest = i;
      highest = i;
      ++above;
    }
  }
  if (above < 2) {
    start = 0.0;
    end = 0.0;
    return;
  }
  start = static_cast<double>(lowest);
  end = static_cast<double>(highest);
}

double ProfileSpread(const DoubleList& profile) {
  const int32_t n = profile.count;
  if (n <= 2) return 0.0;
  double sum = 0.0;
  double sumSquares = 0.0;
  for (int32_t i = 0; i < n; ++i) {
    sum += profile.data[i];
    sumSquares += profile.data[i] * profile.data[i];
  }
  const double mean = sum / static_cast<double>(n);
  const double meanSquare = sumSquares / static_cast<double>(n);
  const double variance = meanSquare - mean * mean;
  return variance > 0.0 ? std::sqrt(variance) : 0.0;
}

PositionClass ClassifyPosition(const DoubleList& columns, const DoubleList& rows,
                               double flatnessThreshold) {
  double x0 = 0.0;
  double x1 = 0.0;
  double y0 = 0.0;
  double y1 = 0.0;
  ProfileExtent(columns, x0, x1);
  ProfileExtent(rows, y0, y1);
  const int left = BorderClass(x0, columns.count);
  const int right = BorderClass(x1, columns.count);
  const int top = BorderClass(y0, rows.count);
  const int bottom = BorderClass(y1, rows.count);

  const double spreadX = ProfileSpread(columns);
  const double spreadY = ProfileSpread(rows);
  const double squares = spreadX * spreadX + spreadY * spreadY;
  const double sigma = squares > 0.0 ? std::sqrt(squares) : 0.0;

  if (flatnessThreshold > sigma) return kFlat;
  if (left == -1 && right == 1 && top == -1 && bottom == 1) return kFull;
  if (left == 1 || right == -1 || top == 1 || bottom == -1) return kUndecided;
  const int inside = (left == 0) + (right == 0) + (top == 0) + (bottom == 0);
  return inside == 4 ? kInside : kTouching;
}

}  // namespace Project
