// TakeProgressStep and CancelRequested.
#include "filter/analysis/host_calls.h"

namespace Project {

void TakeProgressStep(ProgressCounter& progress, AnalysisHost& host) {
  ++progress.done;
  host.ReportProgress(progress.done, progress.total);
}

bool CancelRequested(AnalysisHost& host) {
  if (!host.TestAbort()) return false;
  host.SetResultCode(kUserCanceled);
  return true;
}

}  // namespace Project
