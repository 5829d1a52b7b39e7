// The selector dispatcher.
#include "host/dispatcher.h"

#include <new>

#include "core/service.h"
#include "host/create_filter.h"
#include "host/init_framework.h"
#include "host/rastrix_filter.h"
#include "host/tile_allocator.h"

namespace Vireo {
namespace {

// The end of a filter object's life, and of the run's framework state.
void TearDown(CRastrixFilter* filter) {
  delete filter;
  ReleaseServices();
  InstallTileAllocator(nullptr);
}

CRastrixFilter* Create(int32_t filterIndex) {
  InitFramework();
  CRastrixFilter* filter = CreateFilter(filterIndex);
  // An index without a filter class is a failure, not an object.
  if (filter == nullptr) throw std::bad_alloc();
  return filter;
}

const PropertyProcTable* PropertyProcsOf(const void* record) {
  return record != nullptr ? static_cast<const FilterRecord*>(record)->propertyProcs : nullptr;
}

int16_t ServeAbout(void* record, intptr_t* dataSlot, int32_t filterIndex,
                   CRastrixFilter*& working) {
  // A run's object that an about request finds is taken out of the module's
  // reach by the about object; it is ended here rather than left behind.
  CRastrixFilter* orphan = CRastrixFilter::Current();
  working = Create(filterIndex);
  const int16_t result = working->OnAbout(record, dataSlot);
  CRastrixFilter* done = working;
  working = nullptr;
  TearDown(done);
  if (orphan != nullptr) TearDown(orphan);
  return result;
}

int16_t ServeRunSelector(int16_t selector, void* record, intptr_t* dataSlot, int32_t filterIndex,
                         CRastrixFilter*& working) {
  working = CRastrixFilter::Current();
  if (working == nullptr) {
    working = Create(filterIndex);
    working->AttachFilterRecord(record);
    if (working->SupportsHighDpi()) working->ReadHighDpiProperty(PropertyProcsOf(record));
    working->ReadHostInterfaceProperties(PropertyProcsOf(record));
  }
  int16_t result = 1;
  switch (selector) {
    case kSelectorParameters:
      result = working->OnParameters(record, dataSlot);
      break;
    case kSelectorPrepare:
      result = working->OnPrepare(record, dataSlot);
      break;
    default:
      result = working->OnStart(record, dataSlot);
      break;
  }
  working->HandlePendingEvents();
  if (result != 0) {
    CRastrixFilter* failed = working;
    working = nullptr;
    TearDown(failed);
  }
  return result;
}

int16_t ServeContinue(void* record, intptr_t* dataSlot, CRastrixFilter*& working) {
  working = CRastrixFilter::Current();
  if (working == nullptr) return 0;
  const int16_t result = working->OnContinue(record, dataSlot);
  working->HandlePendingEvents();
  if (result != 0) {
    // A host ends the run at a failing continue without a finish, and its
    // next run may hand over other tables: the object lives on, but nothing
    // it took from this run's record may be called after this call returns.
    working->ReleaseHostSuites();
    InstallTileAllocator(nullptr);
  }
  return result;
}

int16_t ServeFinish(void* record, intptr_t* dataSlot, CRastrixFilter*& working) {
  working = CRastrixFilter::Current();
  int16_t result = 0;
  if (working != nullptr) {
    result = working->OnFinish(record, dataSlot);
    CRastrixFilter* finished = working;
    working = nullptr;
    delete finished;
  }
  ReleaseServices();
  InstallTileAllocator(nullptr);
  return result;
}

int16_t Serve(int16_t selector, void* record, intptr_t* dataSlot, int32_t filterIndex,
              CRastrixFilter*& working) {
  switch (selector) {
    case kSelectorAbout:
      return ServeAbout(record, dataSlot, filterIndex, working);
    case kSelectorParameters:
    case kSelectorPrepare:
    case kSelectorStart:
      return ServeRunSelector(selector, record, dataSlot, filterIndex, working);
    case kSelectorContinue:
      return ServeContinue(record, dataSlot, working);
    case kSelectorFinish:
      return ServeFinish(record, dataSlot, working);
    default:
      return 0;
  }
}

}  // namespace

void RunFilterSelector(int16_t selector, void* record, intptr_t* dataSlot, int16_t* result,
                       int32_t filterIndex) {
  CRastrixFilter* working = nullptr;
  int16_t outcome = 1;
  try {
    outcome = Serve(selector, record, dataSlot, filterIndex, working);
  } catch (...) {
    outcome = 1;
    try {
      TearDown(working);
    } catch (...) {
      // Nothing more can be undone; the host still gets its answer.
    }
  }
  if (result != nullptr) *result = outcome;
}

}  // namespace Vireo
