// Project::CFringe: prepare, start, continue and finish.
#include "filter/fringe.h"

#include "core/rastrix_error.h"
#include "filter/analysis/driver.h"
#include "filter/frame_view.h"
#include "filter/fringe_analysis_host.h"
#include "filter/fringe_record.h"
#include "filter/memory_claim.h"
#include "filter/module_result.h"
#include "filter/result_keys.h"
#include "host/descriptor_write.h"

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
  FilterRecord& record = AttachedRecord();
  const int32_t height = int32_t{record.filterRect.bottom} - int32_t{record.filterRect.top};
  const int32_t width = int32_t{record.filterRect.right} - int32_t{record.filterRect.left};
  record.bufferSpace = 0;
  record.maxSpace = MemoryClaim(record.planes, width, height);
  return true;
}

bool CFringe::DoStart() {
  // A code left over from a run that did not reach finish: no analysis.
  if (resultCode_ != 0) {
    WriteEmptyFringeRecord(*this);
  } else {
    StartAnalysis();
  }
  return true;
}

void CFringe::StartAnalysis() {
  FilterRecord& record = AttachedRecord();
  // The whole filter area, all planes, in one input and one output buffer.
  const auto lastPlane = static_cast<int16_t>(record.planes - 1);
  record.outLoPlane = 0;
  record.inLoPlane = 0;
  record.outHiPlane = lastPlane;
  record.inHiPlane = lastPlane;
  record.dataLayoutRequest = 1;
  record.outRect = record.filterRect;
  record.inRect = record.filterRect;
  constexpr int32_t kOneToOne = 0x10000;
  record.inputRate = kOneToOne;
  record.maskRate = kOneToOne;
  record.maskRect = {};

  const Vireo::AdvanceStateProc advance = AdvanceStateProcedure();
  // Without the procedure no frame is delivered; buffers still in the record
  // belong to no request of this run and must not be read.
  resultCode_ = advance != nullptr ? advance() : Vireo::kParamErr;
  if (resultCode_ != 0) {
    WriteEmptyFringeRecord(*this);
  } else {
    FringeAnalysisHost host(*this);
    RunAnalysis(FrameViewFromRecord(record), host, ModuleAnalysisResult());
  }
  record.inRect = {};
  record.outRect = {};
  record.maskRect = {};
}

bool CFringe::DoContinue(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  const Vireo::AbortProc abort = AbortProcedure();
  const bool canceled = abort != nullptr && abort() != 0;
  if (canceled || resultCode_ != 0) {
    resultCode_ = Vireo::kUserCanceledErr;
    return false;
  }
  FilterRecord& record = AttachedRecord();
  record.inRect = {};
  record.outRect = {};
  record.maskRect = {};
  return true;
}

void CFringe::DoFinish(FilterRecord* /*record*/, intptr_t* /*dataSlot*/) {
  if (resultCode_ != 0) {
    resultCode_ = 0;
    return;
  }
  int16_t error = 0;
  Vireo::WriteDescriptor(HandleProcs(), DescriptorParams(), PutResultKeys, error);
  resultCode_ = error;
}

}  // namespace Project
