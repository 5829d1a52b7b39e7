// Creation of the filter object when memory runs out: the program's allocator
// is replaced here so that a chosen allocation fails.
#include <gtest/gtest.h>

#include <cstdlib>
#include <new>

#include "core/service.h"
#include "host/dispatcher.h"
#include "host/entry_point.h"
#include "host/rastrix_filter.h"
#include "support/fake_host.h"
#include "support/test_environment.h"

namespace {
// Counts down allocations while armed; the one that reaches zero fails.
int g_allocationsUntilFailure = 0;
}  // namespace

void* operator new(std::size_t size) {
  if (g_allocationsUntilFailure > 0 && --g_allocationsUntilFailure == 0) throw std::bad_alloc();
  if (void* block = std::malloc(size == 0 ? 1 : size)) return block;
  throw std::bad_alloc();
}

void operator delete(void* block) noexcept {
  std::free(block);
}
void operator delete(void* block, std::size_t /*size*/) noexcept {
  std::free(block);
}

namespace {

TEST(AllocationFailureTest, CreationWithoutMemoryAnswersOneAndLeavesNoObject) {
  FringeTest::AlertCapture alerts;
  FringeTest::FakeHost host;
  host.SetDocument(30, 30, 1, 1);
  int16_t result = 77;
  // The first allocation of the prepare selector is the filter object itself.
  g_allocationsUntilFailure = 1;
  ENTRYPOINT1(Vireo::kSelectorPrepare, &host.record, &host.dataSlot, &result);
  g_allocationsUntilFailure = 0;
  EXPECT_EQ(result, 1);
  EXPECT_EQ(Vireo::CRastrixFilter::Current(), nullptr);
  EXPECT_TRUE(Vireo::NoLiveServices());
  EXPECT_EQ(host.record.maxSpace, 64 * 1024 * 1024) << "prepare must not have run";

  // Memory back: the next selector creates the object as usual.
  ENTRYPOINT1(Vireo::kSelectorPrepare, &host.record, &host.dataSlot, &result);
  EXPECT_EQ(result, 0);
  EXPECT_NE(Vireo::CRastrixFilter::Current(), nullptr);
  ENTRYPOINT1(Vireo::kSelectorFinish, &host.record, &host.dataSlot, &result);
  EXPECT_EQ(Vireo::CRastrixFilter::Current(), nullptr);
}

TEST(AllocationFailureTest, AnAboutObjectThatCannotBeMadeAnswersOne) {
  FringeTest::FakeHost host;
  int16_t result = 77;
  g_allocationsUntilFailure = 1;
  ENTRYPOINT1(Vireo::kSelectorAbout, &host.about, &host.dataSlot, &result);
  g_allocationsUntilFailure = 0;
  EXPECT_EQ(result, 1);
  EXPECT_EQ(Vireo::CRastrixFilter::Current(), nullptr);
}

}  // namespace
