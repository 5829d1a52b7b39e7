// The angle vote, literally: one least-squares direction per point, its sums
// taken over the window in list order.
#include <algorithm>
#include <cmath>
#include <cstddef>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/angle.h"
#include "filter/analysis/reference/literal_stages.h"

namespace Project::Reference {

bool EstimateAngle(const DoubleList& xs, const DoubleList& ys, int32_t bins, double& angle) {
  const int32_t n = xs.count;
  if (n != ys.count || n < 6) {
    angle = 0.0;
    return false;
  }
  if (bins < 1) return false;
  const std::unique_ptr<double[]> histogram =
      AllocateZeroed<double>(static_cast<std::size_t>(bins));
  if (!histogram) return false;

  const auto w = static_cast<uint32_t>(std::max(n / 32, 4));
  for (int32_t i = 0; i < n; ++i) {
    double a = LocalDirection(xs, ys, i, w);
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
    const double position = std::floor((a + 45.0) * static_cast<double>(bins) / 90.0 + 0.5);
    if (!(position > -2147483649.0 && position < 2147483648.0)) continue;
    const auto bin = static_cast<int32_t>(position);
    if (bin >= 0 && bin < bins) histogram[bin] += 1.0;
  }

  int32_t peak = 0;
  for (int32_t j = 1; j < bins; ++j) {
    if (histogram[j] > histogram[peak]) peak = j;
  }
  const double peakAngle = static_cast<double>(peak) * 90.0 / static_cast<double>(bins) - 45.0;
  double weight = 0.0;
  double moment = 0.0;
  for (int32_t j = std::max(peak - 5, 0); j < std::min(peak + 5, bins); ++j) {
    weight += histogram[j];
    moment += (static_cast<double>(j) * 90.0 / static_cast<double>(bins) - 45.0) * histogram[j];
  }
  angle = weight != 0.0 ? -(moment / weight) : -peakAngle;
  return true;
}

}  // namespace Project::Reference
