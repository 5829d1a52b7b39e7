// StraightenPoints, FitBox with its window sums, GrowQuad and RotatePoint.
// The occupancy arrays hold whole numbers only, so their window sums slide.
#include "filter/analysis/box_fit.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/numeric.h"

namespace Project {
namespace {

constexpr int16_t kMinMargin = 10;

// The working arrays of one axis, released when the fit returns.
struct AxisCells {
  int32_t cells = 0;
  std::unique_ptr<int32_t[]> counts;
  std::unique_ptr<double[]> occupancy;
  std::unique_ptr<double[]> copy;
  std::unique_ptr<double[]> scratch;

  bool Allocate(int64_t n) {
    if (n < 1 || n > INT32_MAX) return false;
    cells = static_cast<int32_t>(n);
    const auto size = static_cast<std::size_t>(n);
    counts = AllocateZeroed<int32_t>(size);
    occupancy = AllocateZeroed<double>(size);
    copy = AllocateZeroed<double>(size);
    scratch = AllocateZeroed<double>(size);
    return counts && occupancy && copy && scratch;
  }
};

// The near and far side of one axis, as positions.
struct Sides {
  double low = 0.0;
  double high = 0.0;
};

// WindowSum for arrays of whole numbers: each window's sum follows from the
// one before by one entry in and one out, exact because every partial sum
// is a whole number far below 2^53.
void WholeWindowSum(double* values, double* scratch, int32_t length, int32_t window) {
  const int32_t half = window / 2;
  const int32_t tail = window - half - 1;
  const int32_t begin = std::max(half, 0);
  const int32_t end = std::min(length - tail, length);
  if (begin >= end) return;
  if (window <= 0) {
    std::fill(values + begin, values + end, 0.0);
    return;
  }
  std::copy_n(values, length, scratch);
  double sum = 0.0;
  for (int32_t j = begin - half; j <= begin + tail; ++j) sum += scratch[j];
  values[begin] = sum;
  for (int32_t i = begin + 1; i < end; ++i) {
    sum += scratch[i + tail] - scratch[i - half - 1];
    values[i] = sum;
  }
}

double LargestEntry(const double* values, int32_t length) {
  double largest = values[0];
  for (int32_t k = 1; k < length; ++k) largest = std::max(largest, values[k]);
  return largest;
}

// Finds the two sides of one axis from the coordinates of the points.
bool FitAxis(const DoubleList& list, int32_t n, const AnalysisParams& params, Sides& sides) {
  double lowest = list.data[0];
  double highest = list.data[0];
  for (int32_t k = 1; k < n; ++k) {
    lowest = std::min(lowest, list.data[k]);
    highest = std::max(highest, list.data[k]);
  }
  auto margin = static_cast<int16_t>(TruncToInt32((highest - lowest) * 0.25));
  if (margin < kMinMargin) margin = kMinMargin;
  const double origin = lowest - margin;
  const int64_t cells = static_cast<int64_t>(TruncToInt32(margin + highest)) -
                        static_cast<int64_t>(TruncToInt32(origin)) + 1;
  AxisCells axis;
  if (!axis.Allocate(cells)) return false;

  for (int32_t k = 0; k < list.count; ++k) {
    const int32_t cell = TruncToInt32(list.data[k] - origin);
    if (cell >= 0 && cell < axis.cells) ++axis.counts[cell];
  }
  for (int32_t k = 0; k < axis.cells; ++k) axis.occupancy[k] = axis.counts[k] != 0 ? 1.0 : 0.0;

  // The smoothing window: half the peak of the occupancy summed over the
  // margin, at most the margin itself.
  std::copy_n(axis.occupancy.get(), axis.cells, axis.copy.get());
  WholeWindowSum(axis.copy.get(), axis.scratch.get(), axis.cells, margin);
  auto window = static_cast<int16_t>(
      static_cast<int16_t>(TruncToInt32(LargestEntry(axis.copy.get(), axis.cells))) / 2);
  if (window > margin) window = margin;
  WholeWindowSum(axis.occupancy.get(), axis.scratch.get(), axis.cells, window);
  Sides occupied;
  OccupancyEdges(axis.occupancy.get(), axis.cells, origin, occupied.low, occupied.high);

  // The count edges: cells holding at least minCount points.
  int32_t first = -1;
  int32_t last = -1;
  for (int32_t k = 0; k < axis.cells; ++k) {
    if (axis.counts[k] >= params.minCount) {
      if (first < 0) first = k;
      last = k;
    }
  }
  if (first < 0) {
    sides = occupied;
  } else if (last - first >= params.minSeparation) {
    sides = {first + origin, last + origin};
  } else {
    const double edge = first + origin;
    if (std::abs(occupied.high - edge) <= std::abs(occupied.low - edge)) {
      sides = {occupied.low, edge};
    } else {
      sides = {edge, occupied.high};
    }
  }
  return true;
}

}  // namespace

void RotatePoint(PointD& point, double theta, const PointD& centre) {
  const double c = std::cos(theta);
  const double s = std::sin(theta);
  const double dx = point.x - centre.x;
  const double dy = point.y - centre.y;
  point.x = (dx * c + centre.x) + dy * s;
  point.y = (dy * c + centre.y) - dx * s;
}

void StraightenPoints(DoubleList& xs, DoubleList& ys, double angleDegrees, const PointD& centre) {
  const double theta = angleDegrees * -kRadiansPerDegree;
  const double c = std::cos(theta);
  const double s = std::sin(theta);
  const int32_t n = std::min(xs.count, ys.count);
  for (int32_t k = 0; k < n; ++k) {
    const double dx = xs.data[k] - centre.x;
    const double dy = ys.data[k] - centre.y;
    xs.data[k] = (dx * c + centre.x) + dy * s;
    ys.data[k] = (dy * c + centre.y) - dx * s;
  }
}

void WindowSum(double* values, double* scratch, int32_t length, int32_t window) {
  const int32_t half = window / 2;
  const int32_t tail = window - half - 1;
  std::copy_n(values, length, scratch);
  for (int32_t i = std::max(half, 0); i < length - tail && i < length; ++i) {
    double sum = 0.0;
    for (int32_t j = i - half; j <= i + tail; ++j) sum += scratch[j];
    values[i] = sum;
  }
}

void OccupancyEdges(const double* occupancy, int32_t cells, double origin, double& nearEdge,
                    double& farEdge) {
  const double half = LargestEntry(occupancy, cells) * 0.5;
  const auto crosses = [&](int32_t k) { return std::abs(occupancy[k] - half) <= 1.0; };
  int32_t first = 0;
  for (int32_t k = 0; k < cells; ++k) {
    if (crosses(k)) {
      first = k;
      break;
    }
  }
  int32_t last = -1;
  for (int32_t k = cells - 1; k >= 0; --k) {
    if (crosses(k)) {
      last = k;
      break;
    }
  }
  if (last < 1) last = cells - 1;
  nearEdge = static_cast<double>(first) + origin;
  farEdge = static_cast<double>(last) + origin;
}

bool FitBox(const DoubleList& xs, const DoubleList& ys, BoxCorners& corners,
            const AnalysisParams& params) {
  const int32_t n = std::min(xs.count, ys.count);
  if (n <= 0) return false;
  Sides columns;
  Sides rows;
  if (!FitAxis(xs, n, params, columns) || !FitAxis(ys, n, params, rows)) return false;
  corners[0] = {columns.low, rows.low};
  corners[1] = {columns.high, rows.low};
  corners[2] = {columns.high, rows.high};
  corners[3] = {columns.low, rows.high};
  return true;
}

void GrowQuad(BoxCorners& corners, double a, double b) {
  PointD& p0 = corners[0];
  PointD& p1 = corners[1];
  PointD& p2 = corners[2];
  PointD& p3 = corners[3];
  const double topX = p1.x - p0.x;
  const double topY = p1.y - p0.y;
  const double sideX = p3.x - p0.x;
  const double sideY = p3.y - p0.y;
  const double topLength = std::sqrt(topX * topX + topY * topY);
  const double sideLength = std::sqrt(sideX * sideX + sideY * sideY);
  if (!(topLength > 0.0 && sideLength > 0.0 && topLength + b > 0.0 && sideLength + a > 0.0)) return;
  const PointD u{topX / topLength * b, topY / topLength * b};
  const PointD w{(p2.x - p1.x) / sideLength * a, (p2.y - p1.y) / sideLength * a};
  p0 = {(p0.x - u.x) - w.x, (p0.y - u.y) - w.y};
  p1 = {(p1.x + u.x) - w.x, (p1.y + u.y) - w.y};
  p2 = {(p2.x + u.x) + w.x, (p2.y + u.y) + w.y};
  p3 = {(p3.x - u.x) + w.x, (p3.y - u.y) + w.y};
}

}  // namespace Project
