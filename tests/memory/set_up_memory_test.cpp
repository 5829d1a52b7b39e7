// The one-time memory set-up of a filter object: the tile budget, the
// allocator over the host's buffer suite, the scratch volumes, and the
// allocator's removal at the end of every run.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "alert_log.h"
#include "core/service.h"
#include "core/system_error.h"
#include "fake_host.h"
#include "host/buffer_suite_allocator.h"
#include "host/dispatcher.h"
#include "host/four_char_code.h"
#include "host/rastrix_filter.h"
#include "host/virtual_heap.h"
#include "platform/platform.h"

namespace Vireo {
namespace {

constexpr std::uint64_t kMiB = 1024 * 1024;
constexpr std::uint64_t kGiB = 1024 * kMiB;
const std::string kBufferSuite = "Rastrix Buffer Suite for Plug-ins/1";

// The bytes of an ASCII path in the platform's wide characters, with or
// without a terminator.
std::vector<unsigned char> WidePath(const std::string& path, bool terminated = true) {
  std::vector<unsigned char> bytes;
  auto append = [&bytes](wchar_t unit) {
    const auto* first = reinterpret_cast<const unsigned char*>(&unit);
    bytes.insert(bytes.end(), first, first + sizeof unit);
  };
  for (const char c : path) append(static_cast<wchar_t>(c));
  if (terminated) append(0);
  return bytes;
}

class SetUpMemoryTest : public ::testing::Test {
 protected:
  void SetUp() override { Platform::SetPhysicalMemoryOverride(16 * kGiB); }
  void TearDown() override {
    ReleaseServices();
    InstallTileAllocator(nullptr);
    Platform::SetPhysicalMemoryOverride(0);
    EXPECT_EQ(host.Misuses(), 0);
  }

  // Runs the set-up of a fresh filter object with the given buffer space.
  CVirtualHeap& SetUpWithSpace(CRastrixFilter& filter, std::int32_t bufferSpace) {
    host.Record().bufferSpace = bufferSpace;
    filter.AttachFilterRecord(&host.Record());
    filter.SetUpMemory();
    return CServiceT<CVirtualHeap>::Get();
  }

  HostFake::FakeHost host;
};

TEST_F(SetUpMemoryTest, BudgetFollowsTheBufferSpaceOnASixteenGigabyteMachine) {
  {
    CRastrixFilter filter(0);
    EXPECT_EQ(SetUpWithSpace(filter, 100 * kMiB).TileBudget(), 100 * kMiB);
    EXPECT_TRUE(filter.MemoryReady());
  }
  ReleaseServices();
  CRastrixFilter filter(0);
  EXPECT_EQ(SetUpWithSpace(filter, 8 * kMiB).TileBudget(), 32 * kMiB);
}

TEST_F(SetUpMemoryTest, ANegativeBufferSpaceKeepsTheBudgetWithinItsBounds) {
  CRastrixFilter filter(0);
  EXPECT_EQ(SetUpWithSpace(filter, -1).TileBudget(), 3 * kGiB);
}

TEST_F(SetUpMemoryTest, InstallsAnAllocatorOverTheBufferSuiteAndDrawsTilesFromIt) {
  CRastrixFilter filter(0);
  CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  ASSERT_NE(InstalledTileAllocator(), nullptr);
  EXPECT_EQ(host.AcquireLog(), std::vector<std::string>{kBufferSuite});
  void* tile = heap.AcquireTile(3);
  EXPECT_EQ(host.BufferSuiteNews(), 1);
  EXPECT_EQ(host.BufferSuiteLive(), 1U);
  heap.ReleaseTile(tile);
  ReleaseServices();  // the heap goes, and with it every block
  EXPECT_EQ(host.BufferSuiteDisposes(), 1);
  EXPECT_EQ(host.BufferSuiteLive(), 0U);
  // The suite is held outside the cache: the object releases nothing.
  EXPECT_TRUE(host.ReleaseLog().empty());
}

TEST_F(SetUpMemoryTest, WithoutABufferSuiteTilesComeFromTheProcessHeap) {
  host.OfferBufferSuite(false);
  CRastrixFilter filter(0);
  CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  EXPECT_EQ(InstalledTileAllocator(), nullptr);
  void* tile = heap.AcquireTile(3);
  ASSERT_NE(tile, nullptr);
  heap.ReleaseTile(tile);
  EXPECT_EQ(host.BufferSuiteNews(), 0);
}

TEST_F(SetUpMemoryTest, AFailingBufferSuiteRaisesOutOfMemoryForTheTile) {
  host.FailBufferSuiteNew(true);
  CRastrixFilter filter(0);
  CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  EXPECT_THROW(heap.AcquireTile(0), CSystemError);
  EXPECT_EQ(heap.HeldBytes(), 0U);
}

TEST_F(SetUpMemoryTest, ASecondSetUpChangesNothing) {
  host.volumeCount = 1;
  host.volumeHandles = {WidePath("C:\\Scratch")};
  CRastrixFilter filter(0);
  CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  const CVirtualAllocator* allocator = InstalledTileAllocator();
  const auto acquisitions = host.AcquireLog().size();
  const int volumeReads = host.PropertyGets(FourCharCode("svlp"));

  host.Record().bufferSpace = 8 * kMiB;
  host.OfferBufferSuite(false);
  filter.SetUpMemory();
  EXPECT_EQ(heap.TileBudget(), 100 * kMiB);
  EXPECT_EQ(InstalledTileAllocator(), allocator);
  EXPECT_EQ(host.AcquireLog().size(), acquisitions);
  EXPECT_EQ(host.PropertyGets(FourCharCode("svlp")), volumeReads);
}

TEST_F(SetUpMemoryTest, HandsTheScratchVolumesToTheHeapAndEveryHandleBack) {
  host.volumeCount = 2;
  host.volumeHandles = {WidePath("C:\\Scratch"), WidePath("D:\\")};
  CRastrixFilter filter(0);
  const CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  ASSERT_TRUE(heap.HasBackingStorage());
  EXPECT_EQ(heap.ScratchVolumes(), (std::vector<std::wstring>{L"C:\\Scratch", L"D:\\"}));
  EXPECT_EQ(host.LiveHandles(), 0U);
  EXPECT_EQ(host.LockedHandles(), 0);
}

TEST_F(SetUpMemoryTest, SetsUpEmptyBackingStorageWithoutVolumes) {
  host.volumeCountReadable = false;
  CRastrixFilter filter(0);
  const CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  EXPECT_TRUE(heap.HasBackingStorage());
  EXPECT_TRUE(heap.ScratchVolumes().empty());
  EXPECT_EQ(host.PropertyGets(FourCharCode("svlp")), 0);
}

TEST_F(SetUpMemoryTest, ReadsNoVolumesForANegativeCount) {
  host.volumeCount = -5;
  host.volumeHandles = {WidePath("C:\\Scratch")};
  CRastrixFilter filter(0);
  EXPECT_TRUE(SetUpWithSpace(filter, 100 * kMiB).ScratchVolumes().empty());
  EXPECT_EQ(host.PropertyGets(FourCharCode("svlp")), 0);
}

TEST_F(SetUpMemoryTest, ReadsAHugeCountAsAtMostSixtyFourVolumes) {
  host.volumeCount = static_cast<intptr_t>(1) << 30;
  host.volumeHandles.assign(100, WidePath("E:\\"));
  CRastrixFilter filter(0);
  EXPECT_EQ(SetUpWithSpace(filter, 100 * kMiB).ScratchVolumes().size(), 64U);
  EXPECT_EQ(host.PropertyGets(FourCharCode("svlp")), 64);
  EXPECT_EQ(host.LiveHandles(), 0U);
}

TEST_F(SetUpMemoryTest, SkipsEmptyUnlockableAndMissingVolumesAndBoundsAnUnterminatedOne) {
  host.volumeCount = 5;
  std::vector<unsigned char> unterminated = WidePath("G:\\Open", false);
  unterminated.push_back('Z');  // and a stray byte short of a whole character
  host.volumeHandles = {
      {},                                 // empty handle
      WidePath("F:\\Locked"),             // lock fails
      unterminated,                       // read up to the handle's end, no further
      WidePath(std::string("H:\0X", 4)),  // text ends at the first terminator
  };                                      // index 4: the host has none
  host.unlockableHandles = {1};
  CRastrixFilter filter(0);
  const CVirtualHeap& heap = SetUpWithSpace(filter, 100 * kMiB);
  EXPECT_EQ(heap.ScratchVolumes(), (std::vector<std::wstring>{L"G:\\Open", L"H:"}));
  EXPECT_EQ(host.LiveHandles(), 0U);
  EXPECT_EQ(host.LockedHandles(), 0);
}

// Through the dispatcher: whatever becomes of the run, the allocator installed
// at prepare is gone once the run is over.
class RunTeardownTest : public SetUpMemoryTest {
 protected:
  std::int16_t Run(std::int16_t selector) {
    std::int16_t result = -1;
    RunFilterSelector(selector, &host.Record(), &slot, &result, 0);
    return result;
  }
  intptr_t slot = 0;
};

TEST_F(RunTeardownTest, FinishRemovesTheAllocator) {
  host.Record().maxSpace = static_cast<std::int32_t>(200 * kMiB);
  ASSERT_EQ(Run(kSelectorPrepare), 0);
  ASSERT_NE(InstalledTileAllocator(), nullptr);
  EXPECT_EQ(CServiceT<CVirtualHeap>::Get().TileBudget(), 100 * kMiB);  // half the budget
  EXPECT_EQ(Run(kSelectorFinish), 0);
  EXPECT_EQ(InstalledTileAllocator(), nullptr);
  EXPECT_FALSE(CServiceT<CVirtualHeap>::Exists());
}

TEST_F(RunTeardownTest, AFailedPrepareRemovesTheAllocator) {
  HostFake::ScopedAlertLog alerts;
  host.Record().maxSpace = static_cast<std::int32_t>(200 * kMiB);
  host.volumeCount = 1;
  host.volumePathThrows = true;  // fails after the allocator went in
  EXPECT_EQ(Run(kSelectorPrepare), 1);
  EXPECT_EQ(InstalledTileAllocator(), nullptr);
  EXPECT_EQ(alerts.Lines().size(), 1U);
  EXPECT_EQ(Run(kSelectorContinue), 0);  // the object is gone as well
}

TEST_F(RunTeardownTest, AboutAndALoneFinishRemoveAnInstalledAllocator) {
  InstallTileAllocator(new CBufferSuiteAllocator(nullptr));
  EXPECT_EQ(Run(kSelectorAbout), 0);
  EXPECT_EQ(InstalledTileAllocator(), nullptr);
  InstallTileAllocator(new CBufferSuiteAllocator(nullptr));
  EXPECT_EQ(Run(kSelectorFinish), 0);
  EXPECT_EQ(InstalledTileAllocator(), nullptr);
}

}  // namespace
}  // namespace Vireo
