// Profile extent, spread and the position class.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "filter/analysis/classification.h"
#include "filter/analysis/double_list.h"
#include "filter/analysis/profiles.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::TestFrame;

DoubleList ListOf(const std::vector<double>& values) {
  DoubleList list;
  AllocList(list, static_cast<int32_t>(values.size()));
  for (size_t i = 0; i < values.size(); ++i) list.data[i] = values[i];
  return list;
}

// n entries of `base` with `value` at the given indices.
DoubleList Profile(int n, double base, const std::vector<int>& at, double value) {
  std::vector<double> values(static_cast<size_t>(n), base);
  for (int i : at) values[static_cast<size_t>(i)] = value;
  return ListOf(values);
}

std::vector<int> Range(int first, int last) {
  std::vector<int> out;
  for (int i = first; i <= last; ++i) out.push_back(i);
  return out;
}

struct Extent {
  double start = -1.0;
  double end = -1.0;
};

Extent Measure(const DoubleList& profile) {
  Extent e;
  ProfileExtent(profile, e.start, e.end);
  return e;
}

TEST(ProfileExtentTest, SmallProfiles) {
  Extent two = Measure(Profile(2, 0, {1}, 5));
  EXPECT_EQ(two.start, -1.0);  // left as they were
  EXPECT_EQ(two.end, -1.0);
  for (int n : {3, 27}) {
    Extent e = Measure(Profile(n, 0, {1, 2}, 5));
    EXPECT_EQ(e.start, 0.0) << n;
    EXPECT_EQ(e.end, 0.0) << n;
  }
  Extent measured = Measure(Profile(28, 0, {12, 14}, 5));
  EXPECT_EQ(measured.start, 12.0);
  EXPECT_EQ(measured.end, 14.0);
}

TEST(ProfileExtentTest, OnlyTheInnerRangeIsLookedAt) {
  // Entries above the mean only at 9 and n - 10; the heavy ends do not count.
  DoubleList p = Profile(60, 0, {9, 50}, 3);
  for (int i : {0, 8, 51, 59}) p.data[i] = 1000;
  Extent e = Measure(p);
  EXPECT_EQ(e.start, 9.0);
  EXPECT_EQ(e.end, 50.0);
}

TEST(ProfileExtentTest, MeanDividesByTheMeasuredCount) {
  // 22 measured entries of 1 with 2 at 15 and 20: mean 24 / 22 > 1, so only
  // those two lie above it (dividing by all 40 entries would take them all).
  DoubleList p = Profile(40, 1, {15, 20}, 2);
  Extent e = Measure(p);
  EXPECT_EQ(e.start, 15.0);
  EXPECT_EQ(e.end, 20.0);
}

TEST(ProfileExtentTest, FewerThanTwoAboveTheMeanGivesZero) {
  Extent one = Measure(Profile(50, 0, {30}, 4));
  EXPECT_EQ(one.start, 0.0);
  EXPECT_EQ(one.end, 0.0);
  Extent none = Measure(Profile(50, 2, {}, 0));
  EXPECT_EQ(none.start, 0.0);
  EXPECT_EQ(none.end, 0.0);
}

TEST(ProfileSpreadTest, PopulationStandardDeviation) {
  EXPECT_EQ(ProfileSpread(ListOf({1, 2, 3, 4})), std::sqrt(1.25));
  EXPECT_EQ(ProfileSpread(ListOf({5, 5, 5})), 0.0);
  EXPECT_EQ(ProfileSpread(ListOf({0, 10})), 0.0);  // two entries or fewer
  EXPECT_EQ(ProfileSpread(DoubleList{}), 0.0);
}

TEST(ClassifyPositionTest, ConstantProfilesAreFlat) {
  DoubleList columns = Profile(100, 3.25, {}, 0);
  DoubleList rows = Profile(80, 7.5, {}, 0);
  EXPECT_EQ(ClassifyPosition(columns, rows, 10.0), kFlat);
  EXPECT_EQ(ClassifyPosition(columns, rows, 1e-9), kFlat);
  EXPECT_NE(ClassifyPosition(columns, rows, 0.0), kFlat);
}

TEST(ClassifyPositionTest, SmallBumpBelowTheThresholdIsFlat) {
  DoubleList columns = Profile(100, 0, Range(40, 59), 2);
  DoubleList rows = Profile(80, 0, Range(30, 49), 2);
  EXPECT_EQ(ClassifyPosition(columns, rows, 10.0), kFlat);
  EXPECT_EQ(ClassifyPosition(columns, rows, 1.0), kInside);
}

TEST(ClassifyPositionTest, DarkSquareInsideAWhiteFrame) {
  TestFrame frame(100, 80, 3);
  frame.FillRect(40, 30, 60, 50, 0);
  CountingHost host;
  DoubleList columns;
  DoubleList rows;
  ASSERT_TRUE(AllocList(columns, 100));
  ASSERT_TRUE(AllocList(rows, 80));
  ProgressCounter progress{1000, 0};
  ComputeProfiles(frame.View(), host, columns, rows, progress);
  Extent x = Measure(columns);
  Extent y = Measure(rows);
  EXPECT_EQ(x.start, 40.0);
  EXPECT_EQ(x.end, 59.0);
  EXPECT_EQ(y.start, 30.0);
  EXPECT_EQ(y.end, 49.0);
  EXPECT_EQ(ProfileSpread(columns), 8.0);
  EXPECT_DOUBLE_EQ(ProfileSpread(rows), std::sqrt(75.0));
  EXPECT_EQ(ClassifyPosition(columns, rows, 10.0), kInside);
  EXPECT_EQ(ClassifyPosition(columns, rows, 11.78), kInside);
  EXPECT_EQ(ClassifyPosition(columns, rows, 11.80), kFlat);

  TestFrame touching(100, 80, 3);
  touching.FillRect(0, 30, 20, 50, 0);
  ASSERT_TRUE(AllocList(columns, 100));
  ASSERT_TRUE(AllocList(rows, 80));
  ComputeProfiles(touching.View(), host, columns, rows, progress);
  EXPECT_EQ(Measure(columns).start, 9.0);
  EXPECT_EQ(ClassifyPosition(columns, rows, 10.0), kTouching);
}

TEST(ClassifyPositionTest, BorderMarginIsElevenEntries) {
  const DoubleList rows = Profile(80, 0, Range(30, 49), 50);
  // Start at 11: near border (touching); at 12: inside.
  EXPECT_EQ(ClassifyPosition(Profile(100, 0, Range(11, 50), 50), rows, 10.0), kTouching);
  EXPECT_EQ(ClassifyPosition(Profile(100, 0, Range(12, 50), 50), rows, 10.0), kInside);
  // End at n - 11: far border; at n - 12: inside.
  EXPECT_EQ(ClassifyPosition(Profile(100, 0, Range(50, 89), 50), rows, 10.0), kTouching);
  EXPECT_EQ(ClassifyPosition(Profile(100, 0, Range(50, 88), 50), rows, 10.0), kInside);
}

TEST(ClassifyPositionTest, RunToAllFourBordersIsFull) {
  const DoubleList columns = Profile(100, 0, {10, 90}, 500);
  const DoubleList rows = Profile(80, 0, {11, 69}, 500);
  EXPECT_EQ(ClassifyPosition(columns, rows, 10.0), kFull);
}

TEST(ClassifyPositionTest, TouchingOneTwoOrThreeBorders) {
  const DoubleList inner = Profile(100, 0, Range(40, 60), 50);
  const DoubleList toLeft = Profile(100, 0, Range(0, 60), 50);
  const DoubleList across = Profile(100, 0, {10, 90}, 50);
  const DoubleList rowsInner = Profile(80, 0, Range(30, 40), 50);
  const DoubleList rowsToBottom = Profile(80, 0, Range(30, 79), 50);
  EXPECT_EQ(ClassifyPosition(inner, rowsInner, 10.0), kInside);
  EXPECT_EQ(ClassifyPosition(toLeft, rowsInner, 10.0), kTouching);
  EXPECT_EQ(ClassifyPosition(toLeft, rowsToBottom, 10.0), kTouching);
  EXPECT_EQ(ClassifyPosition(across, rowsToBottom, 10.0), kTouching);
}

TEST(ClassifyPositionTest, ContradictingExtentsAreUndecided) {
  const DoubleList rows = Profile(80, 0, Range(30, 49), 50);
  // A single entry above the mean: start = end = 0, so the right side sits at
  // the near border.
  EXPECT_EQ(ClassifyPosition(Profile(100, 0, {50}, 500), rows, 10.0), kUndecided);
  // The smallest accepted frame always measures 0 ... 0 on its axis.
  EXPECT_EQ(ClassifyPosition(Profile(27, 0, Range(5, 20), 500), rows, 10.0), kUndecided);
  // A run that starts at the far border.
  EXPECT_EQ(ClassifyPosition(Profile(100, 0, {89, 90}, 500), rows, 10.0), kUndecided);
}

}  // namespace
