// The analysis's view of the host, over the filter object.
#include "filter/fringe_analysis_host.h"

#include "filter/fringe.h"
#include "filter/fringe_record.h"

namespace Project {

bool FringeAnalysisHost::TestAbort() {
  // A host without an abort test cannot ask to cancel.
  const Vireo::AbortProc abort = filter_.AbortProcedure();
  return abort != nullptr && abort() != 0;
}

void FringeAnalysisHost::ReportProgress(int32_t done, int32_t total) {
  if (const Vireo::ProgressProc progress = filter_.ProgressProcedure()) progress(done, total);
}

void FringeAnalysisHost::SetResultCode(int16_t code) {
  filter_.SetResultCode(code);
}

void FringeAnalysisHost::WriteFringeRecord(const CornerQuad& corners, int16_t confidence) {
  Project::WriteFringeRecord(filter_, corners, confidence);
}

void FringeAnalysisHost::WriteEmptyFringeRecord() {
  Project::WriteEmptyFringeRecord(filter_);
}

}  // namespace Project
