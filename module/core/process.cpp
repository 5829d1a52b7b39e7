// The framework's process object and its event queue.
#include "core/process.h"

namespace Vireo {
namespace {
CProcess* g_currentProcess = nullptr;
}

CProcess::CProcess() {
  g_currentProcess = this;
}

CProcess::~CProcess() {
  // Events still queued run now, on the thread that ends the object, so that
  // no trace line is lost.
  HandlePendingEvents();
  if (g_currentProcess == this) g_currentProcess = nullptr;
}

CProcess* CProcess::Current() {
  return g_currentProcess;
}

void CProcess::PostEvent(std::unique_ptr<CEvent> event) {
  if (!event) return;
  const std::lock_guard<std::mutex> hold(queueLock_);
  queue_.push_back(std::move(event));
}

void CProcess::HandlePendingEvents() {
  std::vector<std::unique_ptr<CEvent>> pending;
  {
    const std::lock_guard<std::mutex> hold(queueLock_);
    pending.swap(queue_);
  }
  for (auto& event : pending) {
    try {
      HandleEvent(*event);
    } catch (...) {
      // The thread that posted the event is no longer waiting for it; there
      // is nobody to hand the failure to, and the destructor runs this too.
    }
  }
}

bool CProcess::TranslateKeyString(CText& /*text*/) {
  return false;
}

Platform::WindowHandle CProcess::AlertOwnerWindow() {
  return nullptr;
}

}  // namespace Vireo
