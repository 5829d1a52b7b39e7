// The POSIX side of the seam: no windows, no activation contexts. Alerts go to
// standard error as title and message, a beep makes no sound.
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <thread>

#include "platform/alert_log.h"
#include "platform/platform.h"
#include "platform/system_side.h"

namespace Vireo::Platform {

namespace Side {

uint64_t QueryPhysicalMemory() {
  const long pages = sysconf(_SC_PHYS_PAGES);
  const long pageSize = sysconf(_SC_PAGESIZE);
  if (pages <= 0 || pageSize <= 0) return 0;
  return static_cast<uint64_t>(pages) * static_cast<uint64_t>(pageSize);
}

void FillProcessHandles(ProcessHandles& handles, void* moduleInstance) {
  handles.moduleInstance = moduleInstance;
  handles.hostModule = nullptr;
  handles.processHeap = nullptr;
}

}  // namespace Side

bool IsSystemVersionAtLeast(uint32_t /*major*/, uint32_t /*minor*/, uint16_t /*servicePack*/) {
  return true;
}

void MakeProcessDpiAware() {}

void InitCommonControls() {}

uint32_t CurrentThreadId() {
  // A stable 32-bit figure per thread; only compared for equality.
  const auto hash = std::hash<std::thread::id>{}(std::this_thread::get_id());
  return static_cast<uint32_t>(hash ^ (hash >> 32));
}

WindowHandle ActiveWindow() {
  return nullptr;
}

void ShowErrorAlert(WindowHandle /*owner*/, const std::string& title, const std::string& message) {
  if (DivertAlert(title, message)) return;
  std::fprintf(stderr, "%s\n%s\n", title.c_str(), message.c_str());
  std::fflush(stderr);
}

void BeepExclamation() {
  DivertBeep();
}

std::string SystemMessageText(uint32_t number) {
  char buffer[256] = {};
  // The GNU and the XSI variants differ in their result; both fill or point.
  const auto outcome = strerror_r(static_cast<int>(number), buffer, sizeof buffer);
  if constexpr (std::is_same_v<decltype(outcome), char* const>) {
    return outcome != nullptr ? std::string(outcome) : std::string();
  } else {
    return outcome == 0 ? std::string(buffer) : std::string();
  }
}

uint32_t LastSystemError() {
  return static_cast<uint32_t>(errno);
}

}  // namespace Vireo::Platform
