// Project::CFringe: prepare, start, continue and finish.
#include "filter/fringe.h"

#include "core/rastrix_error.h"
#include "filter/memory_claim.h"

namespace Project {

using Vireo::FilterRecord;

CFringe::CFringe() : CRastrixFilter(0) {}

CFringe::~CFringe() = default;

const Vireo::DataRecordProcTable* CFringe::DataRecordProcs() const {
  // Null-tested like the frame's accessor: before the first selector no
  // record is attached.
  const FilterRecord* record = GetFilterRecord();
  return record != nullptr ? record->dataRecordProcs : nullptr;
}

const Vireo::HandleProcTable* CFringe::HandleProcs() const {
  const FilterRecord* record = GetFilterRecord();
  return record != nullptr ? record->handleProcs : nullptr;
}

void CFringe::DoAbout(const Vireo::AboutRecord* /*record*/, intptr_t* /*dataSlot*/) {}

bool CFringe::DoParameters(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  return true;
}

bool CFringe::DoPrepare() {
  FilterRecord& record = *GetFilterRecord();
  const int32_t height = int32_t{record.filterRect.bottom} - int32_t{record.filterRect.top};
  const int32_t width = int32_t{record.filterRect.right} - int32_t{record.filterRect.left};
  record.bufferSpace = 0;
  record.maxSpace = MemoryClaim(record.planes, width, height);
  return true;
}

bool CFringe::DoStart() {
  if (resultCode_ == 0) StartAnalysis();
  return true;
}

void CFringe::StartAnalysis() {}

bool CFringe::DoContinue(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  const Vireo::AbortProc abort = AbortProcedure();
  const bool canceled = abort != nullptr && abort() != 0;
  if (canceled || resultCode_ != 0) {
    resultCode_ = Vireo::kUserCanceledErr;
    return false;
  }
  FilterRecord& record = *GetFilterRecord();
  record.inRect = {};
  record.outRect = {};
  record.maskRect = {};
  return true;
}

void CFringe::DoFinish(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  if (resultCode_ != 0) resultCode_ = 0;
}

}  // namespace Project
