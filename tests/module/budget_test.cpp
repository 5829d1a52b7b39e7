// Prepare: the share-out of the host's memory budget by the frame, and the
// filter's own claim that follows it.
#include <gtest/gtest.h>

#include <limits>

#include "core/service.h"
#include "filter/memory_claim.h"
#include "host/dispatcher.h"
#include "host/entry_point.h"
#include "host/rastrix_filter.h"
#include "support/fake_host.h"
#include "support/test_environment.h"

namespace {

using FringeTest::FakeHost;

struct Shares {
  int32_t maxSpace = -1;
  int32_t bufferSpace = -1;
};

// Records the figures the share-out leaves for the filter's own prepare.
class ShareWatcher : public Vireo::CRastrixFilter {
 public:
  ShareWatcher() : CRastrixFilter(0) {}
  bool refuseSplit = false;
  Shares seen;
  bool SplitBufferSpace(uint32_t total, uint32_t& first, uint32_t& second) override {
    return !refuseSplit && CRastrixFilter::SplitBufferSpace(total, first, second);
  }
  bool DoPrepare() override {
    seen = {GetFilterRecord()->maxSpace, GetFilterRecord()->bufferSpace};
    return true;
  }
};

class BudgetTest : public ::testing::Test {
 protected:
  void SetUp() override { host_.SetDocument(10, 10, 1, 1); }
  void TearDown() override { Vireo::ReleaseServices(); }

  Shares ShareOut(int32_t budget) {
    ShareWatcher filter;
    host_.record.maxSpace = budget;
    EXPECT_EQ(filter.OnPrepare(&host_.record, &host_.dataSlot), 0);
    return filter.seen;
  }

  FringeTest::AlertCapture alerts_;
  FakeHost host_;
};

TEST_F(BudgetTest, HalvesAreGivenBackToTheHostWithNoBufferSpace) {
  const Shares threeMiB = ShareOut(3 * 1024 * 1024);
  EXPECT_EQ(threeMiB.maxSpace, 1536 * 1024);
  EXPECT_EQ(threeMiB.bufferSpace, 0);
}

TEST_F(BudgetTest, EmptyAndOneByteBudgets) {
  const Shares none = ShareOut(0);
  EXPECT_EQ(none.maxSpace, 0);
  EXPECT_EQ(none.bufferSpace, 0);
  const Shares oneByte = ShareOut(1);
  EXPECT_EQ(oneByte.maxSpace, 1);
  EXPECT_EQ(oneByte.bufferSpace, 0);
}

TEST_F(BudgetTest, TheFloorOfHalfAMegabyteHoldsForUnevenSplits) {
  // An uneven split from a filter class: the small part is raised to the floor.
  class Uneven : public ShareWatcher {
   public:
    bool SplitBufferSpace(uint32_t total, uint32_t& first, uint32_t& second) override {
      first = 1024;
      second = total - first;
      return true;
    }
  } filter;
  host_.record.maxSpace = 4 * 1024 * 1024;
  ASSERT_EQ(filter.OnPrepare(&host_.record, &host_.dataSlot), 0);
  // first' = 512 KiB; second' = min(4 MiB - 1 KiB, 4 MiB - 512 KiB).
  EXPECT_EQ(filter.seen.maxSpace, 4 * 1024 * 1024 - 512 * 1024);
}

TEST_F(BudgetTest, ARefusedSplitTellsTheUserThereIsNotEnoughMemory) {
  ShareWatcher filter;
  filter.refuseSplit = true;
  host_.record.maxSpace = 1000;
  EXPECT_EQ(filter.OnPrepare(&host_.record, &host_.dataSlot), 1);
  const std::vector<std::string> expected = {
      "ALERT\tError\tThis plugin requires more memory than the host can currently supply."};
  EXPECT_EQ(alerts_.Lines(), expected);
  EXPECT_EQ(filter.seen.maxSpace, -1) << "the filter's prepare must not run";
}

TEST_F(BudgetTest, TheFilterClaimsTwoBytesPerSampleAndFivePerRowAndColumn) {
  host_.record.planes = 3;
  host_.record.filterRect = {0, 0, 100, 200};
  host_.record.maxSpace = 1 << 30;
  int16_t result = 77;
  ENTRYPOINT1(Vireo::kSelectorPrepare, &host_.record, &host_.dataSlot, &result);
  EXPECT_EQ(result, 0);
  EXPECT_EQ(host_.record.maxSpace, 121500);
  EXPECT_EQ(host_.record.bufferSpace, 0);
  ENTRYPOINT1(Vireo::kSelectorFinish, &host_.record, &host_.dataSlot, &result);
}

TEST_F(BudgetTest, TheClaimOfAnOffsetRectangleCountsOnlyItsSize) {
  host_.record.planes = 1;
  host_.record.filterRect = {-50, 30, 50, 230};
  int16_t result = 77;
  ENTRYPOINT1(Vireo::kSelectorPrepare, &host_.record, &host_.dataSlot, &result);
  EXPECT_EQ(host_.record.maxSpace, 2 * 200 * 100 + 5 * 200 + 5 * 100);
  ENTRYPOINT1(Vireo::kSelectorFinish, &host_.record, &host_.dataSlot, &result);
}

TEST(MemoryClaimTest, SaturatesInsteadOfWrapping) {
  constexpr int32_t kLargest = std::numeric_limits<int32_t>::max();
  EXPECT_EQ(Project::MemoryClaim(3, 30000, 30000), kLargest);
  EXPECT_EQ(Project::MemoryClaim(32767, 65535, 65535), kLargest);
  // Just past 32 bits, and just inside them.
  EXPECT_EQ(Project::MemoryClaim(1, 32767, 32767), kLargest);
  EXPECT_EQ(Project::MemoryClaim(1, 32000, 32000), 2048320000);
}

TEST(MemoryClaimTest, SizesThatDescribeNoFrameClaimNothing) {
  EXPECT_EQ(Project::MemoryClaim(3, -200, 100), 0);
  EXPECT_EQ(Project::MemoryClaim(3, 0, 0), 0);
  // A single empty side still claims its rows (W + H + 2·2H with W = 0).
  EXPECT_EQ(Project::MemoryClaim(3, 0, 10), 50);
}

}  // namespace
