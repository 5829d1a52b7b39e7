// The framework's main-thread id.
#include "core/main_thread.h"

#include <atomic>

#include "platform/platform.h"

namespace Vireo {
namespace {
// Read from other threads by the debug trace, hence atomic.
std::atomic<uint32_t> g_mainThreadId{0};
}  // namespace

void SetMainThreadId(uint32_t id) {
  g_mainThreadId.store(id);
}

uint32_t MainThreadId() {
  return g_mainThreadId.load();
}

bool IsMainThread() {
  return Platform::CurrentThreadId() == g_mainThreadId.load();
}

}  // namespace Vireo
