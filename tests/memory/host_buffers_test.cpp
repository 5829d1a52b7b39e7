// The plug-in object's wrappers over the host's buffer procedures.
#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

#include "core/rastrix_error.h"
#include "fake_host.h"
#include "host/rastrix_filter.h"

namespace Vireo {
namespace {

class HostBuffersTest : public ::testing::Test {
 protected:
  void SetUp() override { filter.AttachFilterRecord(&host.Record()); }

  std::int16_t AllocationError(std::int32_t size) {
    try {
      filter.AllocateHostBuffer(size);
    } catch (const CRastrixError& error) {
      return error.Code();
    }
    return 0;
  }

  HostFake::FakeHost host;
  CRastrixFilter filter{0};
};

TEST_F(HostBuffersTest, NeedsAllFiveProceduresWithinTheCount) {
  EXPECT_TRUE(filter.HasBufferProcs());
  host.BufferProcs().SetCount(4);
  EXPECT_FALSE(filter.HasBufferProcs());
  host.BufferProcs().SetCount(5);
  host.BufferProcs().Remove(3);
  EXPECT_FALSE(filter.HasBufferProcs());
  host.Record().bufferProcs = nullptr;
  EXPECT_FALSE(filter.HasBufferProcs());
}

TEST_F(HostBuffersTest, PassesEachCallThroughToItsProcedure) {
  HostBufferId id = filter.AllocateHostBuffer(64);
  ASSERT_NE(id, nullptr);
  EXPECT_EQ(filter.LockHostBuffer(id, true), id);
  filter.UnlockHostBuffer(id);
  filter.FreeHostBuffer(id);
  filter.FreeHostBuffer(nullptr);  // nothing to free: the host is not called
  host.bufferSpace = 12345;
  EXPECT_EQ(filter.GetHostBufferSpace(), 12345);
  const std::vector<std::pair<std::string, void*>> expected = {
      {"allocate", nullptr}, {"lock", id}, {"unlock", id}, {"free", id}, {"space", nullptr}};
  EXPECT_EQ(host.bufferCalls, expected);
}

TEST_F(HostBuffersTest, AllocationRaisesTheHostsCodeOrMemFull) {
  host.bufferAllocateError = -50;
  EXPECT_EQ(AllocationError(64), -50);
  host.bufferAllocateError = 0;
  host.bufferAllocateGivesNull = true;
  EXPECT_EQ(AllocationError(64), -108);
  host.BufferProcs().Remove(1);
  EXPECT_EQ(AllocationError(64), -108);
}

TEST_F(HostBuffersTest, MissingProceduresGiveNeutralResults) {
  host.BufferProcs().SetCount(0);
  int local = 0;
  EXPECT_EQ(filter.LockHostBuffer(&local, false), nullptr);
  filter.UnlockHostBuffer(&local);
  filter.FreeHostBuffer(&local);
  EXPECT_EQ(filter.GetHostBufferSpace(), 0);
  EXPECT_TRUE(host.bufferCalls.empty());
}

}  // namespace
}  // namespace Vireo
