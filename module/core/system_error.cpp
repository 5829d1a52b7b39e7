// CSystemError and CDebugError.
#include "core/system_error.h"

#include "platform/platform.h"

namespace Vireo {

void CSystemError::DescribeReason(CText& reason) const {
  if (number_ == 0) {
    reason = "$$$/Vireo/SystemError/Win/Unknown=An unknown operating system error has occurred.";
    return;
  }
  reason = CText::FromUtf8(Platform::SystemMessageText(number_));
}

void CDebugError::DescribeTask(CText& task) const {
  task = message_.empty() ? CText("An unknown debugging error was generated.")
                          : CText::FromUtf8(message_);
}

void CDebugError::DescribeReason(CText& reason) const {
  if (file_.empty()) {
    reason = "File not specified.";
    return;
  }
  reason = CText::FromUtf8("File " + file_ + ", Line " + std::to_string(line_) + ".");
}

}  // namespace Vireo
