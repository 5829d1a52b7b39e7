// Local directions and the angle vote.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "filter/analysis/allocation.h"
#include "filter/analysis/angle.h"
#include "filter/analysis/double_list.h"

namespace {

using namespace Project;

constexpr double kPi = 3.14159265358979323846;

struct PointLists {
  DoubleList xs;
  DoubleList ys;
};

PointLists Lists(const std::vector<double>& x, const std::vector<double>& y) {
  PointLists p;
  AllocList(p.xs, static_cast<int32_t>(x.size()));
  AllocList(p.ys, static_cast<int32_t>(y.size()));
  for (size_t i = 0; i < x.size(); ++i) p.xs.data[i] = x[i];
  for (size_t i = 0; i < y.size(); ++i) p.ys.data[i] = y[i];
  return p;
}

// Straight runs of points, each run far from the others along a 20 degree
// chain, so that a window mixing two runs points along the chain (about
// 20 degrees) and never into the bins a test looks at.
struct RunBuilder {
  std::vector<double> x;
  std::vector<double> y;
  int runs = 0;

  RunBuilder& Add(double directionDegrees, int count) {
    const double ox = 1000.0 * runs * std::cos(20.0 * kPi / 180.0);
    const double oy = 1000.0 * runs * std::sin(20.0 * kPi / 180.0);
    const double c = std::cos(directionDegrees * kPi / 180.0);
    const double s = std::sin(directionDegrees * kPi / 180.0);
    for (int t = 0; t < count; ++t) {
      x.push_back(ox + 3.0 * t * c);
      y.push_back(oy + 3.0 * t * s);
    }
    ++runs;
    return *this;
  }

  PointLists Build() const { return Lists(x, y); }
};

double Estimate(const PointLists& p, bool* ok = nullptr, double start = 99.0) {
  double angle = start;
  const bool result = EstimateAngle(p.xs, p.ys, 180, angle);
  if (ok != nullptr) *ok = result;
  return angle;
}

TEST(LocalDirectionTest, RegressionLineDirectionInDegrees) {
  const PointLists p = Lists({0, 2, 4, 6, 8}, {1, 2, 3, 4, 5});
  EXPECT_NEAR(LocalDirection(p.xs, p.ys, 2, 4), std::atan(0.5) * 180.0 / kPi, 1e-7);
  const PointLists down = Lists({0, 1, 2, 3}, {0, -1, -2, -3});
  EXPECT_NEAR(LocalDirection(down.xs, down.ys, 1, 4), -45.0, 1e-7);
}

TEST(LocalDirectionTest, WindowBelowTwoGivesZero) {
  const PointLists p = Lists({0, 2, 4, 6}, {1, 2, 3, 4});
  EXPECT_EQ(LocalDirection(p.xs, p.ys, 1, 1), 0.0);
  EXPECT_EQ(LocalDirection(p.xs, p.ys, 1, 0), 0.0);
}

TEST(LocalDirectionTest, WindowWrapsRoundTheList) {
  // Entries 8, 9, 0 and 1 lie on a line of slope 0.3; the rest do not.
  std::vector<double> x = {10, 11, 50, 20, 70, 30, 90, 40, 8, 9};
  std::vector<double> y = {3.0, 3.3, 90, 5, 60, 80, 7, 30, 2.4, 2.7};
  const PointLists p = Lists(x, y);
  // i = 0, w = 4: indices -2 ... 1, that is 8, 9, 0, 1.
  EXPECT_NEAR(LocalDirection(p.xs, p.ys, 0, 4), std::atan(0.3) * 180.0 / kPi, 1e-7);
  // i = 9, w = 4: indices 7 ... 10, that is 7, 8, 9, 0 (7 is off the line).
  EXPECT_GT(std::abs(LocalDirection(p.xs, p.ys, 9, 4) - std::atan(0.3) * 180.0 / kPi), 1.0);
}

TEST(LocalDirectionTest, CoincidentPointsAndOneColumnDoNotFail) {
  const PointLists same = Lists({5, 5, 5, 5}, {7, 7, 7, 7});
  EXPECT_EQ(LocalDirection(same.xs, same.ys, 1, 4), 0.0);  // atan2(0, 0)
  const PointLists column = Lists({5, 5, 5, 5}, {1, 2, 3, 4});
  const double a = LocalDirection(column.xs, column.ys, 1, 4);
  EXPECT_TRUE(a == 0.0 || std::abs(std::abs(a) - 90.0) < 1e-6) << a;
}

TEST(VoteTest, FoldingKeepsPlusAndMinusFortyFiveApart) {
  EXPECT_EQ(FoldToQuarterTurn(45.0), 45.0);
  EXPECT_EQ(FoldToQuarterTurn(-45.0), -45.0);
  EXPECT_EQ(FoldToQuarterTurn(135.0), -45.0);  // 135 - 180
  EXPECT_EQ(FoldToQuarterTurn(-135.0), 45.0);  // -135 + 180
  EXPECT_EQ(FoldToQuarterTurn(90.0), 0.0);     // not above 90: 90 - 90
  EXPECT_EQ(FoldToQuarterTurn(-90.0), 0.0);
  EXPECT_EQ(FoldToQuarterTurn(100.0), 10.0);
  EXPECT_EQ(FoldToQuarterTurn(-170.0), 10.0);
  EXPECT_EQ(FoldToQuarterTurn(60.0), -30.0);
  EXPECT_EQ(FoldToQuarterTurn(179.5), -0.5);
}

TEST(VoteTest, BinsRoundToTheNearestHalfDegree) {
  EXPECT_EQ(VoteBin(45.0, 180), 180);  // no such bin: dropped
  EXPECT_EQ(VoteBin(44.75, 180), 180);
  EXPECT_EQ(VoteBin(44.7499, 180), 179);
  EXPECT_EQ(VoteBin(-45.0, 180), 0);
  EXPECT_EQ(VoteBin(-44.75, 180), 1);
  EXPECT_EQ(VoteBin(0.0, 180), 90);
  EXPECT_EQ(VoteBin(-0.25, 180), 90);
  EXPECT_EQ(VoteBin(-0.2501, 180), 89);
  EXPECT_EQ(VoteBin(10.0, 90), 55);
}

TEST(EstimateAngleTest, SixPointsAreEnoughFiveAreNot) {
  bool ok = true;
  const PointLists five = Lists({0, 1, 2, 3, 4}, {0, 0, 0, 0, 0});
  EXPECT_EQ(Estimate(five, &ok), 0.0);
  EXPECT_FALSE(ok);
  const PointLists six = Lists({0, 1, 2, 3, 4, 5}, {0, 0, 0, 0, 0, 0});
  const double angle = Estimate(six, &ok);
  EXPECT_TRUE(ok);
  EXPECT_EQ(angle, 0.0);
  EXPECT_TRUE(std::signbit(angle));  // -(0 / weight): an upright outline gives -0.0
}

TEST(EstimateAngleTest, UnequalListsWriteZero) {
  bool ok = true;
  const PointLists p = Lists({0, 1, 2, 3, 4, 5, 6}, {0, 0, 0, 0, 0, 0});
  EXPECT_EQ(Estimate(p, &ok), 0.0);
  EXPECT_FALSE(ok);
}

TEST(EstimateAngleTest, NoBinsOrNoHistogramLeaveTheAngle) {
  const PointLists p = Lists({0, 1, 2, 3, 4, 5}, {0, 1, 2, 3, 4, 5});
  double angle = 7.5;
  EXPECT_FALSE(EstimateAngle(p.xs, p.ys, 0, angle));
  EXPECT_EQ(angle, 7.5);
  LimitAnalysisAllocations(0);
  EXPECT_FALSE(EstimateAngle(p.xs, p.ys, 180, angle));
  UnlimitAnalysisAllocations();
  EXPECT_EQ(angle, 7.5);
}

TEST(EstimateAngleTest, IdenticalPointsVoteForZero) {
  const PointLists p = Lists({4, 4, 4, 4, 4, 4, 4}, {9, 9, 9, 9, 9, 9, 9});
  EXPECT_EQ(Estimate(p), 0.0);
}

TEST(EstimateAngleTest, SingleDirectionGivesItsNegative) {
  EXPECT_NEAR(Estimate(RunBuilder().Add(10.0, 30).Build()), -10.0, 1e-9);
  EXPECT_NEAR(Estimate(RunBuilder().Add(-7.5, 30).Build()), 7.5, 1e-9);
  // Folding: 100 degrees is -80, then 10; -170 is 10, and 190 is 10 again.
  EXPECT_NEAR(Estimate(RunBuilder().Add(100.0, 30).Build()), -10.0, 1e-9);
  EXPECT_NEAR(Estimate(RunBuilder().Add(-170.0, 30).Build()), -10.0, 1e-9);
}

TEST(EstimateAngleTest, EqualPeaksGoToTheLowerBin) {
  // Nine clean votes each for 10 degrees (bin 110) and 30 degrees (bin 150).
  const PointLists p = RunBuilder().Add(10.0, 12).Add(30.0, 12).Build();
  EXPECT_NEAR(Estimate(p), -10.0, 1e-9);
  const PointLists q = RunBuilder().Add(30.0, 12).Add(10.0, 12).Build();
  EXPECT_NEAR(Estimate(q), -10.0, 1e-9);
}

TEST(EstimateAngleTest, WeightedMeanOverFiveBinsBelowAndFourAbove) {
  // Peak at 10 degrees (bin 110) with 17 votes; 7 votes at 7.5 degrees
  // (bin 105, inside the window) and at 12.5 degrees (bin 115, outside).
  const PointLists inside = RunBuilder().Add(10.0, 20).Add(7.5, 10).Build();
  EXPECT_NEAR(Estimate(inside), -(10.0 * 17 + 7.5 * 7) / 24.0, 1e-9);
  const PointLists outside = RunBuilder().Add(10.0, 20).Add(12.5, 10).Build();
  EXPECT_NEAR(Estimate(outside), -10.0, 1e-9);
}

TEST(EstimateAngleTest, FoldedFortyFiveIsDroppedMinusFortyFiveCounts) {
  // From 44.75 up every direction falls into bin 180 and casts no vote.
  EXPECT_EQ(Estimate(RunBuilder().Add(44.9, 30).Build()), 45.0);           // no votes at all
  EXPECT_NEAR(Estimate(RunBuilder().Add(44.7, 30).Build()), -44.5, 1e-9);  // bin 179
  // -44.9 counts in bin 0: the peak, averaged with bin 4 (-43) inside its window.
  const PointLists low = RunBuilder().Add(-44.9, 20).Add(-43.0, 10).Build();
  EXPECT_NEAR(Estimate(low), -(-45.0 * 17 + -43.0 * 7) / 24.0, 1e-9);
}

TEST(EstimateAngleTest, StoredAngleStaysWithinTheBinCentres) {
  for (double d = -90.0; d <= 90.0; d += 3.7) {
    const double angle = Estimate(RunBuilder().Add(d, 25).Build());
    EXPECT_GE(angle, -44.5) << d;
    EXPECT_LE(angle, 45.0) << d;
  }
}

}  // namespace
