// The robust line fit: exact on clean edges, unmoved by outliers.
#include "refine/line_fit.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

namespace Refine {
namespace {

std::vector<FitSample> Line(double offset, double slope, int n, double jitter = 0.0) {
  std::vector<FitSample> v;
  for (int i = 0; i < n; ++i) {
    const double t = 10.0 + 3.0 * i;
    // A fixed, zero-mean wobble in place of noise keeps the test exact.
    const double wobble = jitter * std::sin(1.7 * i);
    v.push_back({t, offset + slope * t + wobble, 1.0});
  }
  return v;
}

TEST(LineFit, RecoversACleanLine) {
  const auto fit = FitLineRobust(Line(-3.25, 0.004, 200));
  ASSERT_TRUE(fit.ok);
  EXPECT_NEAR(fit.offset, -3.25, 1e-6);
  EXPECT_NEAR(fit.slope, 0.004, 1e-9);
  EXPECT_EQ(fit.inliers, 200);
  EXPECT_LT(fit.rms, 1e-6);
}

TEST(LineFit, IgnoresAThirdOfWildPositions) {
  auto samples = Line(12.0, -0.01, 300, 0.2);
  for (size_t i = 0; i < samples.size(); i += 3) samples[i].s += (i % 2 == 0 ? 25.0 : -40.0);
  const auto fit = FitLineRobust(samples);
  ASSERT_TRUE(fit.ok);
  EXPECT_NEAR(fit.offset, 12.0, 0.05);
  EXPECT_NEAR(fit.slope, -0.01, 1e-4);
  EXPECT_NEAR(fit.inliers, 200, 2);
  EXPECT_LT(fit.rms, 0.25);
}

TEST(LineFit, AClusterOfDustDoesNotPullTheLine) {
  // A run of neighbouring positions all on a speck, 6 px off.
  auto samples = Line(0.0, 0.0, 120, 0.1);
  for (size_t i = 40; i < 70; ++i) samples[i].s = 6.0;
  const auto fit = FitLineRobust(samples);
  ASSERT_TRUE(fit.ok);
  EXPECT_NEAR(fit.offset + fit.slope * 200.0, 0.0, 0.05);
}

TEST(LineFit, RefusesTooFewPositions) {
  EXPECT_FALSE(FitLineRobust(Line(0.0, 0.0, 5)).ok);
  EXPECT_FALSE(FitLineRobust({}).ok);
  // All at one t: no slope to find.
  std::vector<FitSample> same(20, FitSample{5.0, 1.0, 1.0});
  EXPECT_FALSE(FitLineRobust(same).ok);
}

}  // namespace
}  // namespace Refine
