// The reporter service.
#include "core/reporter.h"

#include "core/process.h"
#include "core/resolve_text.h"
#include "platform/platform.h"

namespace Vireo {

void ComposeReport(const CException& exception, CText& task, CText& reason) {
  exception.GetTask(task);
  exception.GetReason(reason);
  if (task.IsEmpty()) {
    task = reason;
    reason.Clear();
  }
  if (task.IsEmpty()) task = "$$$/Vireo/Reporter/Default=The operation could not be completed.";
}

void CReporter::Report(const CException& exception) {
  if (exception.IsSilent()) return;
  if (!exception.ShowsAlert()) {
    Platform::BeepExclamation();
    return;
  }
  CText task;
  CText reason;
  ComposeReport(exception, task, reason);
  CText title = "$$$/Vireo/Reporter/Title=Error";
  ResolveText(title);
  ResolveText(task);
  ResolveText(reason);
  CText message = task;
  if (!reason.IsEmpty()) message += CText("\n\n") + reason;

  Platform::WindowHandle owner = nullptr;
  if (CProcess* process = CProcess::Current()) owner = process->AlertOwnerWindow();
  // Without the host's main window the alert still needs a parent in front.
  if (owner == nullptr) owner = Platform::ActiveWindow();
  Platform::ShowErrorAlert(owner, title.Utf8(), message.Utf8());
}

void CReporter::ReportDefault() {
  Report(CException());
}

}  // namespace Vireo
