// The edge point search over a hand-made edge map.
#include <gtest/gtest.h>

#include <utility>
#include <vector>

#include "filter/analysis/allocation.h"
#include "filter/analysis/double_list.h"
#include "filter/analysis/edge_points.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::Layout;
using AnalysisTest::TestFrame;

using Points = std::vector<std::pair<int, int>>;  // (x, y)

struct Search {
  bool found = false;
  Points points;
  DoubleList xs;
  DoubleList ys;
  int32_t steps = 0;
};

// A frame whose edge-map plane is all "no edge" (255); tests mark edges.
Search RunSearch(TestFrame& frame, CountingHost& host, Rect rect) {
  Search s;
  ProgressCounter progress{100000, 0};
  s.found = FindEdgePoints(frame.View(), host, rect, s.xs, s.ys, progress);
  s.steps = progress.done;
  if (s.found) {
    for (int k = 0; k < s.xs.count; ++k) {
      s.points.emplace_back(static_cast<int>(s.xs.data[k]), static_cast<int>(s.ys.data[k]));
    }
  }
  return s;
}

TEST(EdgePointsTest, WholeFrameRectangleIsClampedInsideTheOuterRing) {
  TestFrame frame(20, 16, 1);
  // Edges on the outer ring only: never examined.
  for (int x = 0; x < 20; ++x) {
    frame.SetMap(x, 0, 0);
    frame.SetMap(x, 15, 0);
  }
  for (int y = 0; y < 16; ++y) {
    frame.SetMap(0, y, 0);
    frame.SetMap(19, y, 0);
  }
  CountingHost host;
  Search s = RunSearch(frame, host, Rect{0, 0, 16, 20});
  EXPECT_FALSE(s.found);
  // Rows 1 ... 14 and columns 1 ... 18 scanned, each from both sides.
  EXPECT_EQ(s.steps, 2 * 14 + 2 * 18);
  EXPECT_EQ(host.abortCalls, s.steps);
  EXPECT_EQ(s.xs.data, nullptr);  // released on failure
  EXPECT_EQ(s.ys.data, nullptr);
  EXPECT_EQ(s.xs.count, 0);
}

TEST(EdgePointsTest, ThreeByThreeIsTheSmallestRectangle) {
  TestFrame frame(20, 20, 1);
  frame.SetMap(6, 6, 0);
  CountingHost host;
  Search ok = RunSearch(frame, host, Rect{5, 5, 7, 7});
  EXPECT_TRUE(ok.found);
  EXPECT_EQ(ok.steps, 12);
  for (Rect small : {Rect{5, 5, 7, 6}, Rect{5, 5, 6, 7}}) {
    CountingHost other;
    Search s = RunSearch(frame, other, small);
    EXPECT_FALSE(s.found);
    EXPECT_EQ(s.steps, 0);
    EXPECT_EQ(other.abortCalls, 0);
    EXPECT_EQ(s.xs.data, nullptr);
  }
}

TEST(EdgePointsTest, PassOrderAndPointOrder) {
  TestFrame frame(20, 20, 1);
  frame.SetMap(8, 6, 0);   // row 6, between the sides: found by both row passes
  frame.SetMap(12, 9, 0);  // row 9
  CountingHost host;
  Search s = RunSearch(frame, host, Rect{5, 5, 15, 15});
  ASSERT_TRUE(s.found);
  const Points expected = {{8, 6}, {12, 9},   // from the left, rows in order
                           {8, 6}, {12, 9},   // from the right
                           {8, 6}, {12, 9},   // from the top, columns in order
                           {8, 6}, {12, 9}};  // from the bottom
  EXPECT_EQ(s.points, expected);
  EXPECT_EQ(s.xs.count, 8);
  EXPECT_EQ(s.ys.count, 8);
  EXPECT_EQ(s.steps, 44);
}

TEST(EdgePointsTest, FirstEdgeFromEachSideWins) {
  TestFrame frame(20, 20, 1);
  frame.SetMap(7, 10, 0);
  frame.SetMap(11, 10, 0);
  CountingHost host;
  Search s = RunSearch(frame, host, Rect{5, 5, 15, 15});
  ASSERT_TRUE(s.found);
  const Points expected = {{7, 10}, {11, 10}, {7, 10}, {11, 10}, {7, 10}, {11, 10}};
  EXPECT_EQ(s.points, expected);
}

TEST(EdgePointsTest, EachPassStopsBeforeTheOppositeSide) {
  // One edge on a side line of the rectangle (5, 5, 14, 14): the pass that
  // scans toward that side stops one short of it, the other three find it.
  // Bottom and right are lines that are scanned themselves.
  const std::pair<int, int> onSide[] = {{14, 8}, {5, 11}, {9, 5}, {10, 14}};
  for (const auto& [x, y] : onSide) {
    TestFrame frame(20, 20, 1);
    frame.SetMap(x, y, 0);
    CountingHost host;
    Search s = RunSearch(frame, host, Rect{5, 5, 14, 14});
    ASSERT_TRUE(s.found);
    EXPECT_EQ(s.points, Points(3, {x, y})) << x << "," << y;
  }
  TestFrame inside(20, 20, 1);
  inside.SetMap(13, 8, 0);
  CountingHost host;
  EXPECT_EQ(RunSearch(inside, host, Rect{5, 5, 14, 14}).points.size(), 4U);
}

TEST(EdgePointsTest, EdgeMeansAtMost50) {
  TestFrame frame(20, 20, 1);
  frame.SetMap(8, 7, 51);
  frame.SetMap(9, 7, 50);
  CountingHost host;
  Search s = RunSearch(frame, host, Rect{5, 5, 15, 15});
  ASSERT_TRUE(s.found);
  EXPECT_EQ(s.points.front(), std::make_pair(9, 7));
}

TEST(EdgePointsTest, NearlyTransparentEdgesAreSkippedInFilterCases4And5) {
  for (int16_t filterCase : {1, 4, 5}) {
    TestFrame frame(20, 20, 3, /*alpha=*/true);
    frame.View().filterCase = filterCase;
    frame.SetMap(7, 8, 0);
    frame.Set(7, 8, 3, 9);  // transparency byte 9: skipped in cases 4 and 5
    frame.SetMap(9, 8, 0);
    frame.Set(9, 8, 3, 10);  // 10: counts
    CountingHost host;
    Search s = RunSearch(frame, host, Rect{5, 5, 15, 15});
    ASSERT_TRUE(s.found);
    const bool skips = filterCase != 1;
    EXPECT_EQ(s.points.front(), std::make_pair(skips ? 9 : 7, 8)) << "case " << filterCase;
  }
}

TEST(EdgePointsTest, BottomUpAndPaddedBuffersFindTheSamePoints) {
  Points reference;
  for (const Layout& layout : {Layout{}, Layout{9, 0, false}, Layout{0, 3, true}}) {
    TestFrame frame(30, 24, 3, false, layout);
    for (int x = 8; x < 20; ++x) frame.SetMap(x, 7 + x / 4, 0);
    CountingHost host;
    Search s = RunSearch(frame, host, Rect{2, 2, 22, 28});
    ASSERT_TRUE(s.found);
    if (reference.empty()) {
      reference = s.points;
    } else {
      EXPECT_EQ(s.points, reference);
    }
  }
}

TEST(EdgePointsTest, NoEdgeFailsAfterScanningEveryLine) {
  TestFrame frame(30, 30, 1);
  CountingHost host;
  Search s = RunSearch(frame, host, Rect{9, 9, 21, 21});
  EXPECT_FALSE(s.found);
  EXPECT_EQ(s.steps, 2 * 13 + 2 * 13);
  EXPECT_EQ(s.xs.data, nullptr);
  EXPECT_EQ(s.ys.data, nullptr);
}

TEST(EdgePointsTest, CancelDuringPassThreeFailsAndReleasesTheLists) {
  TestFrame frame(30, 30, 1);
  frame.SetMap(15, 15, 0);
  CountingHost host;
  host.cancelAtCall = 2 * 13 + 3;  // third line of pass 3
  Search s = RunSearch(frame, host, Rect{9, 9, 21, 21});
  EXPECT_FALSE(s.found);
  EXPECT_EQ(host.resultCode, -128);
  EXPECT_EQ(s.steps, 2 * 13 + 2);
  EXPECT_EQ(s.xs.data, nullptr);
  EXPECT_EQ(s.ys.data, nullptr);
}

TEST(EdgePointsTest, RefusedListAllocationFails) {
  for (int32_t allowed : {0, 1}) {
    TestFrame frame(30, 30, 1);
    frame.SetMap(15, 15, 0);
    CountingHost host;
    LimitAnalysisAllocations(allowed);
    Search s = RunSearch(frame, host, Rect{9, 9, 21, 21});
    UnlimitAnalysisAllocations();
    EXPECT_FALSE(s.found);
    EXPECT_EQ(s.steps, 0);
    EXPECT_EQ(s.xs.data, nullptr);
    EXPECT_EQ(s.ys.data, nullptr);
  }
}

}  // namespace
