// The virtual heap: tiles within the budget, from the installed allocator or
// the process heap and back to the same place.
#include "host/virtual_heap.h"

#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <stdexcept>

#include "core/error.h"
#include "core/system_error.h"

namespace Vireo {
namespace {

constexpr std::uint64_t kMiB = 1024 * 1024;

// Counts what it hands out and takes back; can be told to fail.
class CountingAllocator final : public CVirtualAllocator {
 public:
  struct Counts {
    int allocated = 0;
    int freed = 0;
    int foreign = 0;  // blocks freed here that did not come from here
    bool destroyed = false;
  };
  explicit CountingAllocator(Counts& counts, bool fail = false) : counts_(counts), fail_(fail) {}
  ~CountingAllocator() override { counts_.destroyed = true; }

  void* Allocate(std::uint32_t size) override {
    if (fail_) return nullptr;
    ++counts_.allocated;
    auto block = std::make_unique<unsigned char[]>(size);
    void* memory = block.get();
    blocks_[memory] = std::move(block);
    return memory;
  }
  void Free(void* block) override {
    if (blocks_.erase(block) == 1) {
      ++counts_.freed;
    } else {
      ++counts_.foreign;
    }
  }

 private:
  Counts& counts_;
  bool fail_;
  std::map<void*, std::unique_ptr<unsigned char[]>> blocks_;
};

class VirtualHeapTest : public ::testing::Test {
 protected:
  // Removed while the counts it writes to still exist.
  void TearDown() override { InstallTileAllocator(nullptr); }

  CountingAllocator::Counts counts;
  CountingAllocator::Counts first;
  CountingAllocator::Counts second;
};

TEST_F(VirtualHeapTest, TakesTilesFromTheInstalledAllocatorAndGivesThemBack) {
  InstallTileAllocator(new CountingAllocator(counts));
  {
    CVirtualHeap heap;
    heap.SetTileBudget(32 * kMiB);
    void* small = heap.AcquireTile(0);
    void* large = heap.AcquireTile(12);
    EXPECT_EQ(counts.allocated, 2);
    EXPECT_EQ(heap.HeldBytes(), 256U + (256U << 12));
    static_cast<unsigned char*>(large)[(256U << 12) - 1] = 1;  // the whole tile is usable
    heap.ReleaseTile(small);
    EXPECT_EQ(heap.TilesInUse(), 1U);
  }  // the heap gives back what it still holds
  EXPECT_EQ(counts.freed, 2);
  EXPECT_EQ(counts.foreign, 0);
}

TEST_F(VirtualHeapTest, UsesTheProcessHeapWithoutAnAllocator) {
  CVirtualHeap heap;
  heap.SetTileBudget(32 * kMiB);
  void* tile = heap.AcquireTile(4);
  ASSERT_NE(tile, nullptr);
  static_cast<unsigned char*>(tile)[(256U << 4) - 1] = 7;
  heap.ReleaseTile(tile);
  EXPECT_EQ(heap.TilesInUse(), 0U);
}

TEST_F(VirtualHeapTest, AFailingAllocatorRaisesOutOfMemoryWithoutFallingBack) {
  InstallTileAllocator(new CountingAllocator(counts, true));
  CVirtualHeap heap;
  heap.SetTileBudget(32 * kMiB);
  try {
    heap.AcquireTile(0);
    FAIL() << "no error";
  } catch (const CSystemError& error) {
    EXPECT_EQ(error.Number(), 14U);
  }
  EXPECT_EQ(heap.TilesInUse(), 0U);
  EXPECT_EQ(heap.HeldBytes(), 0U);
}

TEST_F(VirtualHeapTest, RefusesATileBeyondTheBudget) {
  CVirtualHeap heap;
  heap.SetTileBudget(32 * kMiB);
  void* one = heap.AcquireTile(CVirtualHeap::kMaxSizeClass);  // 16 MiB
  void* two = heap.AcquireTile(CVirtualHeap::kMaxSizeClass);
  try {
    heap.AcquireTile(0);
    FAIL() << "no error";
  } catch (const CError& error) {
    CText task;
    CText reason;
    error.GetTask(task);
    error.GetReason(reason);
    EXPECT_TRUE(task.IsEmpty());
    EXPECT_EQ(reason.Utf8(),
              "$$$/Vireo/VirtualHeap/AcquireTileError=No more virtual tiles can be allocated.");
    EXPECT_FALSE(error.IsSilent());
    EXPECT_TRUE(error.ShowsAlert());
  }
  heap.ReleaseTile(one);
  heap.ReleaseTile(two);
}

TEST_F(VirtualHeapTest, ReusesSpareTilesAndGivesUpTheExcessWhenTheBudgetShrinks) {
  InstallTileAllocator(new CountingAllocator(counts));
  CVirtualHeap heap;
  heap.SetTileBudget(64 * kMiB);
  void* a = heap.AcquireTile(CVirtualHeap::kMaxSizeClass);
  void* b = heap.AcquireTile(CVirtualHeap::kMaxSizeClass);
  heap.ReleaseTile(a);
  heap.ReleaseTile(b);
  EXPECT_EQ(heap.SpareTiles(), 2U);
  EXPECT_EQ(heap.AcquireTile(CVirtualHeap::kMaxSizeClass), b);  // a spare serves first
  EXPECT_EQ(counts.allocated, 2);
  heap.SetTileBudget(16 * kMiB);  // holds 32 MiB: the spare goes at once
  EXPECT_EQ(heap.SpareTiles(), 0U);
  EXPECT_EQ(counts.freed, 1);
  EXPECT_EQ(heap.HeldBytes(), 16 * kMiB);
  heap.ReleaseTile(b);
}

TEST_F(VirtualHeapTest, GivesATileBackToItsOwnAllocatorAfterTheSlotMovedOn) {
  InstallTileAllocator(new CountingAllocator(first));
  CVirtualHeap heap;
  heap.SetTileBudget(32 * kMiB);
  void* tile = heap.AcquireTile(2);
  InstallTileAllocator(new CountingAllocator(second));
  EXPECT_FALSE(first.destroyed);  // still owed a tile
  void* next = heap.AcquireTile(2);
  EXPECT_EQ(second.allocated, 1);
  heap.ReleaseTile(tile);
  EXPECT_EQ(first.freed, 1);
  EXPECT_TRUE(first.destroyed);
  InstallTileAllocator(nullptr);
  heap.ReleaseTile(next);
  EXPECT_EQ(second.freed, 1);
  EXPECT_EQ(first.foreign + second.foreign, 0);
}

TEST_F(VirtualHeapTest, RefusesBadSizeClassesAndForeignPointers) {
  CVirtualHeap heap;
  heap.SetTileBudget(32 * kMiB);
  EXPECT_THROW(heap.AcquireTile(-1), std::out_of_range);
  EXPECT_THROW(heap.AcquireTile(CVirtualHeap::kMaxSizeClass + 1), std::out_of_range);
  int local = 0;
  EXPECT_THROW(heap.ReleaseTile(&local), std::invalid_argument);
  heap.ReleaseTile(nullptr);
  EXPECT_EQ(heap.HeldBytes(), 0U);
}

}  // namespace
}  // namespace Vireo
