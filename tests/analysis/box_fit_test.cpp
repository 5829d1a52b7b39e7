// Straightening, window sums, the box fit, shrinking and turning back.
#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "filter/analysis/allocation.h"
#include "filter/analysis/box_fit.h"
#include "filter/analysis/double_list.h"

namespace {

using namespace Project;

struct Cloud {
  std::vector<double> x;
  std::vector<double> y;

  void Add(double px, double py) {
    x.push_back(px);
    y.push_back(py);
  }
  void Column(double px, int y0, int y1) {
    for (int v = y0; v <= y1; ++v) Add(px, v);
  }
  void Row(double py, int x0, int x1) {
    for (int h = x0; h <= x1; ++h) Add(h, py);
  }
};

struct Lists {
  DoubleList xs;
  DoubleList ys;
};

Lists ToLists(const Cloud& c) {
  Lists l;
  AllocList(l.xs, static_cast<int32_t>(c.x.size()));
  AllocList(l.ys, static_cast<int32_t>(c.y.size()));
  for (size_t i = 0; i < c.x.size(); ++i) {
    l.xs.data[i] = c.x[i];
    l.ys.data[i] = c.y[i];
  }
  return l;
}

AnalysisParams Params(int32_t minCount) {
  AnalysisParams p;
  p.minCount = minCount;
  return p;
}

struct Box {
  bool ok = false;
  double left = 0, top = 0, right = 0, bottom = 0;
};

Box Fit(const Cloud& cloud, int32_t minCount) {
  Lists l = ToLists(cloud);
  BoxCorners c;
  Box b;
  b.ok = FitBox(l.xs, l.ys, c, Params(minCount));
  if (b.ok) {
    // The fit is upright: check that the corners agree, then read the sides.
    EXPECT_EQ(c[0].y, c[1].y);
    EXPECT_EQ(c[1].x, c[2].x);
    EXPECT_EQ(c[2].y, c[3].y);
    EXPECT_EQ(c[3].x, c[0].x);
    b = {true, c[0].x, c[0].y, c[2].x, c[2].y};
  }
  return b;
}

// An upright outline from (20, 10) to (120, 60), as the edge search gives it.
Cloud Outline() {
  Cloud c;
  c.Column(20, 10, 60);
  c.Column(120, 10, 60);
  c.Row(10, 20, 120);
  c.Row(60, 20, 120);
  return c;
}

TEST(WindowSumTest, SumsAroundEachEntryFromTheOldValues) {
  std::vector<double> v = {1, 2, 3, 4, 5};
  std::vector<double> scratch(5);
  WindowSum(v.data(), scratch.data(), 5, 3);
  EXPECT_EQ(v, (std::vector<double>{1, 6, 9, 12, 5}));

  std::vector<double> even = {1, 2, 3, 4, 5, 6};
  std::vector<double> scratch6(6);
  WindowSum(even.data(), scratch6.data(), 6, 4);  // two before, one after
  EXPECT_EQ(even, (std::vector<double>{1, 2, 10, 14, 18, 6}));
}

TEST(WindowSumTest, WindowsOfOneZeroAndTooLong) {
  std::vector<double> v = {3, 1, 4, 1, 5};
  std::vector<double> scratch(5);
  WindowSum(v.data(), scratch.data(), 5, 1);
  EXPECT_EQ(v, (std::vector<double>{3, 1, 4, 1, 5}));
  WindowSum(v.data(), scratch.data(), 5, 9);  // no entry has a full window
  EXPECT_EQ(v, (std::vector<double>{3, 1, 4, 1, 5}));
  WindowSum(v.data(), scratch.data(), 5, 0);
  EXPECT_EQ(v, (std::vector<double>{0, 0, 0, 0, 0}));
}

TEST(OccupancyEdgesTest, CrossingsAndFallbacks) {
  double nearEdge = 0;
  double farEdge = 0;
  const double ramp[] = {0, 0, 1, 3, 5, 6, 6, 5, 3, 1, 0};  // half the peak: 3
  OccupancyEdges(ramp, 11, -4.0, nearEdge, farEdge);
  EXPECT_EQ(nearEdge, 3 - 4.0);
  EXPECT_EQ(farEdge, 8 - 4.0);
  const double jumps[] = {0, 0, 10, 10, 10, 0, 0};  // nothing within 1.0 of 5
  OccupancyEdges(jumps, 7, 2.5, nearEdge, farEdge);
  EXPECT_EQ(nearEdge, 2.5);     // cell 0
  EXPECT_EQ(farEdge, 6 + 2.5);  // the last cell
  const double onlyFirst[] = {5, 10, 10, 10, 0};
  OccupancyEdges(onlyFirst, 5, 0.0, nearEdge, farEdge);
  EXPECT_EQ(nearEdge, 0.0);
  EXPECT_EQ(farEdge, 4.0);  // the last crossing at cell 0 falls back too
}

TEST(FitBoxTest, UprightOutlineGivesBothCountEdgesOnEachAxis) {
  const Box b = Fit(Outline(), 30);
  ASSERT_TRUE(b.ok);
  EXPECT_EQ(b.left, 20.0);
  EXPECT_EQ(b.right, 120.0);
  EXPECT_EQ(b.top, 10.0);
  EXPECT_EQ(b.bottom, 60.0);
}

TEST(FitBoxTest, NoCountEdgeUsesTheSmoothedOccupancy) {
  // Margin 25, smoothing window 12 (six cells before, five after): the
  // occupancy reaches half height one cell before x = 20 and two after 120.
  const Box b = Fit(Outline(), 1000);
  ASSERT_TRUE(b.ok);
  EXPECT_EQ(b.left, 19.0);
  EXPECT_EQ(b.right, 122.0);
}

TEST(FitBoxTest, SingleCountEdgeSidesWithTheNearerOccupancyEdge) {
  Cloud leftOnly;  // right side broken up: only the left column is long
  leftOnly.Column(20, 10, 60);
  leftOnly.Column(120, 10, 14);
  leftOnly.Row(10, 20, 120);
  leftOnly.Row(60, 20, 120);
  const Box l = Fit(leftOnly, 30);
  ASSERT_TRUE(l.ok);
  EXPECT_EQ(l.left, 20.0);
  EXPECT_EQ(l.right, 122.0);

  Cloud rightOnly;
  rightOnly.Column(20, 10, 14);
  rightOnly.Column(120, 10, 60);
  rightOnly.Row(10, 20, 120);
  rightOnly.Row(60, 20, 120);
  const Box r = Fit(rightOnly, 30);
  ASSERT_TRUE(r.ok);
  EXPECT_EQ(r.left, 19.0);
  EXPECT_EQ(r.right, 120.0);
}

TEST(FitBoxTest, CountEdgeMidwayBetweenOccupancyEdgesIsTheFarSide) {
  // Occupancy edges 19 and 122 for columns 20 ... 120 plus one column 121:
  // 19 and 123, midway 71.
  auto cloud = [](double column) {
    Cloud c;
    c.Row(10, 20, 121);
    c.Row(60, 20, 121);
    c.Column(column, 11, 59);
    return c;
  };
  const Box none = Fit(cloud(71), 1000);
  ASSERT_EQ(none.left, 19.0);
  ASSERT_EQ(none.right, 123.0);
  const Box tie = Fit(cloud(71), 40);
  EXPECT_EQ(tie.left, 19.0);
  EXPECT_EQ(tie.right, 71.0);
  const Box nearer = Fit(cloud(70), 40);
  EXPECT_EQ(nearer.left, 70.0);
  EXPECT_EQ(nearer.right, 123.0);
}

TEST(FitBoxTest, CountEdgesCloserThanTheSeparationAreOne) {
  Cloud c;
  c.Row(10, 20, 120);
  c.Row(60, 20, 120);
  c.Column(50, 11, 59);
  c.Column(59, 11, 59);  // 9 cells on: one edge, at the first
  const Box b = Fit(c, 40);
  EXPECT_EQ(b.left, 50.0);
  EXPECT_EQ(b.right, 122.0);
  c.Column(60, 11, 59);  // 10 cells from the first: two edges
  const Box two = Fit(c, 40);
  EXPECT_EQ(two.left, 50.0);
  EXPECT_EQ(two.right, 60.0);
}

TEST(FitBoxTest, MarginNeverBelowTen) {
  Cloud tiny;
  for (int y = 50; y <= 52; ++y) tiny.Row(y, 50, 52);
  const Box b = Fit(tiny, 1);
  ASSERT_TRUE(b.ok);
  // One count edge at 50 (52 is within the separation); the far side is the
  // last cell, ten cells beyond the cloud.
  EXPECT_EQ(b.left, 50.0);
  EXPECT_EQ(b.right, 62.0);
  EXPECT_EQ(b.top, 50.0);
  EXPECT_EQ(b.bottom, 62.0);
}

TEST(FitBoxTest, CellsTruncateTowardZeroBelowAZeroOrigin) {
  Cloud c;
  c.Add(2.5, 30);
  c.Add(3.5, 31);
  c.Add(4.5, 32);
  const Box b = Fit(c, 1000);
  ASSERT_TRUE(b.ok);
  // Origin 2.5 - 10 = -7.5; cells trunc(14.5) - trunc(-7.5) + 1 = 22.
  EXPECT_EQ(b.left, -7.5);
  EXPECT_EQ(b.right, 21 - 7.5);
}

TEST(FitBoxTest, FailsWithoutPointsOrMemory) {
  DoubleList empty;
  BoxCorners c;
  EXPECT_FALSE(FitBox(empty, empty, c, Params(10)));
  for (int32_t allowed = 0; allowed < 8; ++allowed) {
    Lists l = ToLists(Outline());
    LimitAnalysisAllocations(allowed);
    const bool ok = FitBox(l.xs, l.ys, c, Params(30));
    UnlimitAnalysisAllocations();
    EXPECT_FALSE(ok) << allowed;
  }
}

TEST(GrowQuadTest, NegativeMarginsPullAnUprightBoxIn) {
  BoxCorners c = {{{20, 10}, {120, 10}, {120, 60}, {20, 60}}};
  GrowQuad(c, -1.0, -1.0);
  EXPECT_EQ(c[0].x, 21.0);
  EXPECT_EQ(c[0].y, 11.0);
  EXPECT_EQ(c[1].x, 119.0);
  EXPECT_EQ(c[1].y, 11.0);
  EXPECT_EQ(c[2].x, 119.0);
  EXPECT_EQ(c[2].y, 59.0);
  EXPECT_EQ(c[3].x, 21.0);
  EXPECT_EQ(c[3].y, 59.0);
}

TEST(GrowQuadTest, SideStepsComeFromTheTopAndRightSides) {
  // Not a rectangle: the right side (p2 - p1) is 10 long, the left 5; the
  // step along it is (p2 - p1) scaled by the left side's length.
  BoxCorners c = {{{0, 0}, {10, 0}, {10, 10}, {0, 5}}};
  GrowQuad(c, -1.0, -1.0);
  const double expected[4][2] = {{1, 2}, {9, 2}, {9, 8}, {1, 3}};
  for (int k = 0; k < 4; ++k) {
    EXPECT_EQ(c[k].x, expected[k][0]) << k;
    EXPECT_EQ(c[k].y, expected[k][1]) << k;
  }
}

TEST(GrowQuadTest, DegenerateBoxesStayPut) {
  const BoxCorners boxes[] = {
      {{{5, 5}, {5, 5}, {5, 9}, {5, 9}}},      // zero-length top side
      {{{5, 5}, {6, 5}, {6, 9}, {5, 9}}},      // width 1: not longer than the margin
      {{{5, 5}, {9, 5}, {9, 5.5}, {5, 5.5}}},  // height below 1
  };
  for (const BoxCorners& box : boxes) {
    BoxCorners c = box;
    GrowQuad(c, -1.0, -1.0);
    for (int k = 0; k < 4; ++k) {
      EXPECT_EQ(c[k].x, box[k].x);
      EXPECT_EQ(c[k].y, box[k].y);
    }
  }
}

TEST(RotationTest, PositiveAngleTurnsCounterClockwiseOnScreen) {
  PointD p{10, 0};
  RotatePoint(p, 90 * kRadiansPerDegree, PointD{0, 0});
  EXPECT_NEAR(p.x, 0.0, 1e-6);
  EXPECT_NEAR(p.y, -10.0, 1e-6);
  PointD q{7, 3};
  RotatePoint(q, 0.0, PointD{100, -50});
  EXPECT_EQ(q.x, 7.0);
  EXPECT_EQ(q.y, 3.0);
}

TEST(RotationTest, StraightenThenRotateBackRestoresThePoints) {
  Cloud c = Outline();
  Lists l = ToLists(c);
  const PointD centre{70.25, 35.5};
  StraightenPoints(l.xs, l.ys, 12.5, centre);
  EXPECT_GT(std::abs(l.xs.data[0] - c.x[0]), 1.0);
  for (size_t i = 0; i < c.x.size(); ++i) {
    PointD p{l.xs.data[i], l.ys.data[i]};
    RotatePoint(p, 12.5 * kRadiansPerDegree, centre);
    EXPECT_NEAR(p.x, c.x[i], 1e-9);
    EXPECT_NEAR(p.y, c.y[i], 1e-9);
  }
}

}  // namespace
