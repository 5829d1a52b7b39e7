// The upright box fit, literally: cell counts, occupancy smoothed by window
// sums that add every window entry afresh, occupancy and count edges.
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/box_fit.h"
#include "filter/analysis/numeric.h"
#include "filter/analysis/reference/literal_stages.h"

namespace Project::Reference {
namespace {

struct Axis {
  double low = 0.0;
  double high = 0.0;
};

double Largest(const double* v, int32_t n) {
  double m = v[0];
  for (int32_t k = 1; k < n; ++k) {
    if (v[k] > m) m = v[k];
  }
  return m;
}

bool FitOneAxis(const DoubleList& list, int32_t n, const AnalysisParams& params, Axis& axis) {
  double lo = list.data[0];
  double hi = list.data[0];
  for (int32_t k = 1; k < n; ++k) {
    if (list.data[k] < lo) lo = list.data[k];
    if (list.data[k] > hi) hi = list.data[k];
  }
  auto margin = static_cast<int16_t>(TruncToInt32((hi - lo) * 0.25));
  if (margin < 10) margin = 10;
  const double origin = lo - margin;
  const int64_t cells64 = static_cast<int64_t>(TruncToInt32(margin + hi)) -
                          static_cast<int64_t>(TruncToInt32(origin)) + 1;
  if (cells64 < 1 || cells64 > INT32_MAX) return false;
  const auto cells = static_cast<int32_t>(cells64);
  const auto size = static_cast<std::size_t>(cells);
  const std::unique_ptr<int32_t[]> counts = AllocateZeroed<int32_t>(size);
  const std::unique_ptr<double[]> occupancy = AllocateZeroed<double>(size);
  const std::unique_ptr<double[]> copy = AllocateZeroed<double>(size);
  const std::unique_ptr<double[]> scratch = AllocateZeroed<double>(size);
  if (!counts || !occupancy || !copy || !scratch) return false;

  for (int32_t k = 0; k < list.count; ++k) {
    const int32_t cell = TruncToInt32(list.data[k] - origin);
    if (cell >= 0 && cell < cells) counts[cell] += 1;
  }
  for (int32_t k = 0; k < cells; ++k) occupancy[k] = counts[k] != 0 ? 1.0 : 0.0;
  std::copy_n(occupancy.get(), cells, copy.get());
  WindowSum(copy.get(), scratch.get(), cells, margin);
  auto window =
      static_cast<int16_t>(static_cast<int16_t>(TruncToInt32(Largest(copy.get(), cells))) / 2);
  if (window > margin) window = margin;
  WindowSum(occupancy.get(), scratch.get(), cells, window);
  Axis occupied;
  OccupancyEdges(occupancy.get(), cells, origin, occupied.low, occupied.high);

  int32_t p = -1;
  for (int32_t k = 0; k < cells; ++k) {
    if (counts[k] >= params.minCount) {
      p = k;
      break;
    }
  }
  if (p < 0) {
    axis = occupied;
    return true;
  }
  int32_t q = p;
  for (int32_t k = cells - 1; k >= 0; --k) {
    if (counts[k] >= params.minCount) {
      q = k;
      break;
    }
  }
  if (q - p >= params.minSeparation) {
    axis = {p + origin, q + origin};
    return true;
  }
  const double e = p + origin;
  if (std::abs(occupied.high - e) <= std::abs(occupied.low - e)) {
    axis = {occupied.low, e};
  } else {
    axis = {e, occupied.high};
  }
  return true;
}

}  // namespace

bool FitBox(const DoubleList& xs, const DoubleList& ys, BoxCorners& corners,
            const AnalysisParams& params) {
  const int32_t n = std::min(xs.count, ys.count);
  if (n <= 0) return false;
  Axis columns;
  Axis rows;
  if (!FitOneAxis(xs, n, params, columns) || !FitOneAxis(ys, n, params, rows)) return false;
  corners[0] = {columns.low, rows.low};
  corners[1] = {columns.high, rows.low};
  corners[2] = {columns.high, rows.high};
  corners[3] = {columns.low, rows.high};
  return true;
}

}  // namespace Project::Reference
