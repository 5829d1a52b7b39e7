// CError and CAbort.
#include "core/error.h"

namespace Vireo {

CError::CError(const CText& task, const CText& reason, bool silent, bool alert)
    : task_(task), reason_(reason), silent_(silent), alert_(alert) {}

CError::CError(const char* task, const char* reason, bool silent, bool alert)
    : CError(CText(task), CText(reason), silent, alert) {}

CError::CError(bool silent, bool alert) : silent_(silent), alert_(alert) {}

CError::CError(const CException& other) : silent_(other.IsSilent()), alert_(other.ShowsAlert()) {
  other.GetTask(task_);
  other.GetReason(reason_);
}

CError::CError(const CText& task, const CException& other)
    : task_(task), silent_(other.IsSilent()), alert_(other.ShowsAlert()) {
  other.GetReason(reason_);
}

CError::CError(const std::exception& /*other*/) {}

CError CError::WithReason(const CText& reason, bool silent, bool alert) {
  return CError(CText(), reason, silent, alert);
}

CError CError::WithTask(const CText& task) {
  return CError(task, CText(), false, true);
}

void CAbort::DescribeTask(CText& task) const {
  task = "$$$/Vireo/Abort/Task=The operation was not completed.";
}

void CAbort::DescribeReason(CText& reason) const {
  reason = "$$$/Vireo/Abort/Error=The operation has been canceled.";
}

}  // namespace Vireo
