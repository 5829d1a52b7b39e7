// Tile blocks drawn from the host's buffer suite and given back to it.
#include "host/buffer_suite_allocator.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
#include <vector>

namespace Vireo {
namespace {

struct SuiteLog {
  std::vector<std::uint32_t> requested;
  std::vector<std::uint32_t> minimum;
  std::vector<void*> disposed;
  bool fail = false;
  std::uint32_t shortBy = 0;  // hands out less than asked for
};
SuiteLog* suiteLog = nullptr;

void* NewBuffer(std::uint32_t* requestedSize, std::uint32_t minimumSize) {
  suiteLog->requested.push_back(*requestedSize);
  suiteLog->minimum.push_back(minimumSize);
  if (suiteLog->fail) return nullptr;
  *requestedSize -= suiteLog->shortBy;
  return std::malloc(*requestedSize == 0 ? 1 : *requestedSize);
}

void DisposeBuffer(void** buffer) {
  suiteLog->disposed.push_back(*buffer);
  std::free(*buffer);
  *buffer = nullptr;
}

class BufferSuiteAllocatorTest : public ::testing::Test {
 protected:
  void SetUp() override {
    suiteLog = &log;
    suite[kBufferSuiteNewPosition - 1] = reinterpret_cast<const void*>(&NewBuffer);
    suite[kBufferSuiteDisposePosition - 1] = reinterpret_cast<const void*>(&DisposeBuffer);
  }
  void TearDown() override { suiteLog = nullptr; }

  SuiteLog log;
  std::array<const void*, 4> suite{};
};

TEST_F(BufferSuiteAllocatorTest, AsksForTheSizeAsRequestAndMinimumAndDisposesByAddress) {
  CBufferSuiteAllocator allocator(suite.data());
  void* block = allocator.Allocate(4096);
  ASSERT_NE(block, nullptr);
  EXPECT_EQ(log.requested, std::vector<std::uint32_t>{4096});
  EXPECT_EQ(log.minimum, std::vector<std::uint32_t>{4096});
  allocator.Free(block);
  EXPECT_EQ(log.disposed, std::vector<void*>{block});
  allocator.Free(nullptr);
  EXPECT_EQ(log.disposed.size(), 1U);
}

TEST_F(BufferSuiteAllocatorTest, PassesAFailureOnAsNull) {
  log.fail = true;
  CBufferSuiteAllocator allocator(suite.data());
  EXPECT_EQ(allocator.Allocate(256), nullptr);
}

TEST_F(BufferSuiteAllocatorTest, RefusesABufferSmallerThanAskedFor) {
  log.shortBy = 1;
  CBufferSuiteAllocator allocator(suite.data());
  EXPECT_EQ(allocator.Allocate(512), nullptr);
  EXPECT_EQ(log.disposed.size(), 1U);  // and gives it straight back
}

TEST_F(BufferSuiteAllocatorTest, DoesNothingWithoutTheProcedures) {
  suite = {};
  CBufferSuiteAllocator allocator(suite.data());
  EXPECT_EQ(allocator.Allocate(256), nullptr);
  int local = 0;
  allocator.Free(&local);  // no dispose procedure: nothing is called
  EXPECT_TRUE(log.requested.empty());
  CBufferSuiteAllocator without(nullptr);
  EXPECT_EQ(without.Allocate(256), nullptr);
}

}  // namespace
}  // namespace Vireo
