// Lists, the channel table, 16-bit geometry, pixel addressing, conversions
// and the cancel convention.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <limits>

#include "filter/analysis/allocation.h"
#include "filter/analysis/channels.h"
#include "filter/analysis/double_list.h"
#include "filter/analysis/geometry.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/numeric.h"
#include "filter/analysis/pixel_access.h"
#include "test_frame.h"

namespace {

using namespace Project;

TEST(DoubleListTest, AllocListKeepsTheCountAndClearsTheStorage) {
  DoubleList list;
  ASSERT_TRUE(AllocList(list, 5));
  EXPECT_EQ(list.count, 5);
  ASSERT_NE(list.data, nullptr);
  for (int i = 0; i < 5; ++i) EXPECT_EQ(list.data[i], 0.0);
}

TEST(DoubleListTest, AllocListWithNoPositiveCountFailsButKeepsTheCount) {
  for (int32_t count : {0, -1, -40000}) {
    DoubleList list;
    EXPECT_FALSE(AllocList(list, count));
    EXPECT_EQ(list.count, count);
    EXPECT_EQ(list.data, nullptr);
    EXPECT_FALSE(FreeList(list));
    EXPECT_EQ(list.count, 0);
  }
}

TEST(DoubleListTest, AllocListOverAFullListReplacesItsStorage) {
  DoubleList list;
  ASSERT_TRUE(AllocList(list, 3));
  list.data[0] = 7.0;
  ASSERT_TRUE(AllocList(list, 4));
  EXPECT_EQ(list.data[0], 0.0);
  EXPECT_FALSE(AllocList(list, 0));
  EXPECT_EQ(list.data, nullptr);
}

TEST(DoubleListTest, FreeListAnswersWhetherThereWasStorage) {
  DoubleList list;
  ASSERT_TRUE(AllocList(list, 2));
  EXPECT_TRUE(FreeList(list));
  EXPECT_EQ(list.count, 0);
  EXPECT_EQ(list.data, nullptr);
  EXPECT_FALSE(FreeList(list));
}

TEST(DoubleListTest, RefusedAllocationFailsWithTheCountSet) {
  DoubleList first;
  DoubleList second;
  LimitAnalysisAllocations(1);
  EXPECT_TRUE(AllocList(first, 10));
  EXPECT_FALSE(AllocList(second, 10));
  UnlimitAnalysisAllocations();
  EXPECT_EQ(second.count, 10);
  EXPECT_EQ(second.data, nullptr);
  EXPECT_FALSE(FreeList(second));
  EXPECT_TRUE(AllocList(second, 10));
}

TEST(ChannelCountTest, ModesWithoutACountGiveTheFallback) {
  EXPECT_EQ(ChannelCount(1, 0), 1);
  EXPECT_EQ(ChannelCount(3, 0), 3);
  EXPECT_EQ(ChannelCount(4, 0), 4);
  EXPECT_EQ(ChannelCount(10, 0), 1);
  EXPECT_EQ(ChannelCount(11, 0), 3);
  EXPECT_EQ(ChannelCount(7, 0), 0);
  EXPECT_EQ(ChannelCount(7, 5), 5);
  EXPECT_EQ(ChannelCount(12, 2), 2);
  EXPECT_EQ(ChannelCount(0x8000, 6), 6);  // compared unsigned
}

TEST(GeometryTest, ClipRectIntersectsSigned) {
  Rect r{9, 9, 71, 91};
  ClipRect(r, Rect{0, 0, 80, 100});
  EXPECT_EQ(r.top, 9);
  EXPECT_EQ(r.left, 9);
  EXPECT_EQ(r.bottom, 71);
  EXPECT_EQ(r.right, 91);

  Rect s{-5, 20, 300, 40};
  ClipRect(s, Rect{0, 30, 100, 35});
  EXPECT_EQ(s.top, 0);
  EXPECT_EQ(s.left, 30);
  EXPECT_EQ(s.bottom, 100);
  EXPECT_EQ(s.right, 35);

  Rect empty{50, 50, 60, 60};  // left disjoint: comes out reversed, unchanged otherwise
  ClipRect(empty, Rect{0, 0, 40, 40});
  EXPECT_EQ(empty.top, 50);
  EXPECT_EQ(empty.bottom, 40);
}

TEST(GeometryTest, FullImageCornersUseTheLastRowAndColumn) {
  CornerQuad quad;
  FullImageCorners(quad, Rect{0, 0, 80, 100});
  const int16_t expected[4][2] = {{0, 0}, {0, 99}, {79, 99}, {79, 0}};
  for (int k = 0; k < 4; ++k) {
    EXPECT_EQ(quad.corner[k].v, expected[k][0]);
    EXPECT_EQ(quad.corner[k].h, expected[k][1]);
  }
}

TEST(GeometryTest, OffsetCornersWrapsIn16Bits) {
  CornerQuad quad;
  FullImageCorners(quad, Rect{0, 0, 80, 100});
  OffsetCorners(quad, 30, 50);
  EXPECT_EQ(quad.corner[2].h, 129);
  EXPECT_EQ(quad.corner[2].v, 129);
  EXPECT_EQ(quad.corner[0].h, 30);
  EXPECT_EQ(quad.corner[0].v, 50);
  OffsetCorners(quad, 32767, 0);
  EXPECT_EQ(quad.corner[0].h, -32739);
}

TEST(PixelAccessTest, SignedDistancesAndLargeBuffers) {
  EXPECT_EQ(PixelOffset(2, 3, 100, 4), 308);
  EXPECT_EQ(PixelOffset(2, 3, -100, 4), -292);
  // A 32-bit product would wrap here and address memory the host never gave.
  EXPECT_EQ(PixelOffset(0, 32000, 100000, 4), 3200000000LL);
  EXPECT_EQ(PixelOffset(32000, 0, 0, 70000), 2240000000LL);
}

TEST(NumericTest, TruncationTowardZeroIsDefinedEverywhere) {
  EXPECT_EQ(TruncToInt32(2.9), 2);
  EXPECT_EQ(TruncToInt32(-2.9), -2);
  EXPECT_EQ(TruncToInt32(-0.5), 0);
  EXPECT_EQ(TruncToInt32(2147483647.9), 2147483647);
  EXPECT_EQ(TruncToInt32(-2147483648.9), INT32_MIN);
  EXPECT_EQ(TruncToInt32(3e9), INT32_MIN);
  EXPECT_EQ(TruncToInt32(std::numeric_limits<double>::quiet_NaN()), INT32_MIN);
}

TEST(NumericTest, RoundingIsHalfAwayFromZero) {
  EXPECT_EQ(RoundHalfAway(0.5), 1.0);
  EXPECT_EQ(RoundHalfAway(-0.5), -1.0);
  EXPECT_EQ(RoundHalfAway(2.4999), 2.0);
  EXPECT_EQ(RoundHalfAway(-2.5), -3.0);
  EXPECT_EQ(RoundHalfAway(0.0), 0.0);
  EXPECT_EQ(RoundHalfAway(0.49999999999999994), 1.0);  // floor(a + 0.5) as stated
}

TEST(HostCallsTest, CancelStoresTheUserCancelCode) {
  AnalysisTest::CountingHost host;
  host.cancelAtCall = 2;
  EXPECT_FALSE(CancelRequested(host));
  EXPECT_EQ(host.resultCodeWrites, 0);
  EXPECT_TRUE(CancelRequested(host));
  EXPECT_EQ(host.resultCode, -128);
  EXPECT_EQ(host.resultCodeWrites, 1);
}

}  // namespace
