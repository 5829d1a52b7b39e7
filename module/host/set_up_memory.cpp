// The framework's memory set-up, run once per filter object at the first of
// prepare or start: the tile heap's budget, its allocator over the host's
// buffer suite, and its backing storage on the host's scratch volumes.
#include <new>

#include "core/service.h"
#include "host/buffer_suite.h"
#include "host/buffer_suite_allocator.h"
#include "host/proc_table.h"
#include "host/rastrix_filter.h"
#include "host/scratch_volumes.h"
#include "host/tile_budget.h"
#include "host/virtual_heap.h"
#include "platform/platform.h"

namespace Vireo {
namespace {

// The buffer suite straight from the basic suite, outside the suite cache; the
// allocator holding it is dropped at the end of the run without a release.
const void* AcquireBufferSuite(const BasicSuiteTable* basicSuite) {
  const auto acquire = SuiteProc<AcquireSuiteProc>(basicSuite, 1);
  if (acquire == nullptr) return nullptr;
  const void* suite = nullptr;
  if (acquire(kBufferSuiteName, kBufferSuiteVersion, &suite) != 0) return nullptr;
  return suite;
}

}  // namespace

void CRastrixFilter::PrepareFrameworkMemory() {
  CVirtualHeap& heap = CServiceT<CVirtualHeap>::Get();
  const uint64_t budget = ComputeTileBudget(Platform::TotalPhysicalMemory(),
                                            static_cast<uint32_t>(AttachedRecord().bufferSpace));

  InstallTileAllocator(nullptr);
  if (UsesBufferSuite()) {
    if (const void* suite = AcquireBufferSuite(BasicSuite())) {
      InstallTileAllocator(new (std::nothrow) CBufferSuiteAllocator(suite));
    }
  }
  heap.SetTileBudget(budget);
  if (!heap.HasBackingStorage()) heap.SetUpBackingStorage(ReadScratchVolumes(*this));
}

}  // namespace Vireo
