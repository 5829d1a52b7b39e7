// The root exception: a general task text and no reason.
#include "core/exception.h"

namespace Vireo {

CException::~CException() = default;

void CException::GetTask(CText& task) const {
  task.Clear();
  DescribeTask(task);
}

void CException::DescribeTask(CText& task) const {
  task = "$$$/Vireo/Exception/Task=The operation could not be completed.";
}

void CException::GetReason(CText& reason) const {
  reason.Clear();
  DescribeReason(reason);
}

void CException::DescribeReason(CText& reason) const {
  reason.Clear();
}

}  // namespace Vireo
