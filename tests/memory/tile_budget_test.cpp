// The share of memory the framework's heap may hold.
#include "host/tile_budget.h"

#include <gtest/gtest.h>

namespace Vireo {
namespace {

constexpr std::uint64_t kMiB = 1024 * 1024;
constexpr std::uint64_t kGiB = 1024 * kMiB;

std::uint32_t Space(std::int32_t signedSpace) {
  return static_cast<std::uint32_t>(signedSpace);
}

TEST(TileBudget, FollowsTheBufferSpaceOnASixteenGigabyteMachine) {
  EXPECT_EQ(ComputeTileBudget(16 * kGiB, 100 * kMiB), 100 * kMiB);
  EXPECT_EQ(ComputeTileBudget(16 * kGiB, 8 * kMiB), 32 * kMiB);
  EXPECT_EQ(ComputeTileBudget(16 * kGiB, 0), 32 * kMiB);
  EXPECT_EQ(ComputeTileBudget(16 * kGiB, 32 * kMiB - 1), 32 * kMiB);
  EXPECT_EQ(ComputeTileBudget(16 * kGiB, 2 * kGiB), 2 * kGiB);
}

TEST(TileBudget, NeverPassesThreeGigabytesOrHalfTheMachine) {
  EXPECT_EQ(ComputeTileBudget(16 * kGiB, 0xFFFFFFFFU), 3 * kGiB);
  EXPECT_EQ(ComputeTileBudget(64 * kGiB, Space(-1)), 3 * kGiB);  // negative space
  EXPECT_EQ(ComputeTileBudget(2 * kGiB, 2 * kGiB), 1 * kGiB);    // half of the machine
  EXPECT_EQ(ComputeTileBudget(4 * kGiB, 100 * kMiB), 100 * kMiB);
}

TEST(TileBudget, StaysAtThirtyTwoMegabytesOnASmallMachine) {
  EXPECT_EQ(ComputeTileBudget(48 * kMiB, 1 * kGiB), 32 * kMiB);
  EXPECT_EQ(ComputeTileBudget(0, 1 * kGiB), 32 * kMiB);
  EXPECT_EQ(ComputeTileBudget(0, 0), 32 * kMiB);
}

TEST(TileBudget, ComparesANegativeSpaceByItsUnsignedBits) {
  // 0x80000000 reads as 2 GiB: below the 3 GiB ceiling, so it stands.
  EXPECT_EQ(ComputeTileBudget(64 * kGiB, Space(INT32_MIN)), 2 * kGiB);
  EXPECT_EQ(ComputeTileBudget(64 * kGiB, Space(-1073741824)), 3 * kGiB);  // 0xC0000000
}

}  // namespace
}  // namespace Vireo
