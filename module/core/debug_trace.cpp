// The debug trace and its event.
#include "core/debug_trace.h"

#include <atomic>
#include <cstdio>
#include <memory>

#include "core/main_thread.h"
#include "core/process.h"
#include "core/system_error.h"
#include "platform/platform.h"

namespace Vireo {
namespace {

// The first line in the life of the process starts the file afresh.
std::atomic<bool> g_traceStarted{false};

std::string FormatTraceLine(const char* message, const char* file, int line) {
  const char* safeMessage = message != nullptr ? message : "";
  const char* safeFile = file != nullptr ? file : "";
  const int size = std::snprintf(nullptr, 0, "%s,%s,%d\n", safeMessage, safeFile, line);
  if (size <= 0) return {};
  std::string text(static_cast<size_t>(size) + 1, '\0');
  std::snprintf(text.data(), text.size(), "%s,%s,%d\n", safeMessage, safeFile, line);
  text.resize(static_cast<size_t>(size));
  return text;
}

}  // namespace

void DebugTrace(const char* message, const char* file, int line, bool throwError) {
  if (!IsMainThread()) {
    if (CProcess* process = CProcess::Current()) {
      process->PostEvent(std::make_unique<CDebugEvent>(
          message != nullptr ? message : "", file != nullptr ? file : "", line, throwError));
    }
    return;
  }
  const bool first = !g_traceStarted.exchange(true);
  // A trace file that cannot be written is skipped: tracing never fails the work.
  Platform::AppendTraceLine(Platform::TraceFilePath(kDebugTracePath),
                            FormatTraceLine(message, file, line), first);
  if (throwError) {
    throw CDebugError(message != nullptr ? message : "", file != nullptr ? file : "", line);
  }
}

void CDebugEvent::Run() {
  DebugTrace(message_.c_str(), file_.c_str(), line_, throwError_);
}

}  // namespace Vireo
