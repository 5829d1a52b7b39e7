// The reporter service: shows an exception to the user in an error alert, or
// beeps, or stays quiet, as the exception asks.
#pragma once

#include "core/exception.h"
#include "core/service.h"

namespace Vireo {

class CReporter {
 public:
  void Report(const CException& exception);
  // Reports a default exception: "The operation could not be completed."
  void ReportDefault();
};

// The alert's message: the task, then two line breaks and the reason when
// there is one. An empty task gives way to the reason, then to a default.
// Texts are still key strings; the caller resolves them.
void ComposeReport(const CException& exception, CText& task, CText& reason);

}  // namespace Vireo
