// The operating-system seam: everything the frame takes from the system,
// with a Windows side (the real calls) and a POSIX side (for tests on Linux).
// Alerts and beeps can be diverted to a log file so that tests observe them
// without a window: set FRINGE_ALERT_LOG to a file name.
#pragma once

#include <cstdint>
#include <string>

namespace Vireo::Platform {

using WindowHandle = void*;

// Handles recorded when the module is attached to the host process.
struct ProcessHandles {
  void* moduleInstance = nullptr;  // this module
  void* hostModule = nullptr;      // the image of the host process
  void* processHeap = nullptr;
};

// Records the handles; moduleInstance is this module's own handle.
void RecordProcessHandles(void* moduleInstance);
const ProcessHandles& GetProcessHandles();

// True when the running system is at least the given version; each part is
// compared as greater or equal. Always true on POSIX.
bool IsSystemVersionAtLeast(uint32_t major, uint32_t minor, uint16_t servicePack);

// Marks the process as aware of display scaling when the system offers it.
void MakeProcessDpiAware();

// Registers every common-control window class, within the module's own
// activation context when it has one.
void InitCommonControls();

uint32_t CurrentThreadId();

// The window that is active on the calling thread, or null.
WindowHandle ActiveWindow();

// A modal error alert with one OK button, owned by the given window.
// Texts are UTF-8.
void ShowErrorAlert(WindowHandle owner, const std::string& title, const std::string& message);

// The system's exclamation sound.
void BeepExclamation();

// The system's text for an error number, UTF-8, empty when it has none.
std::string SystemMessageText(uint32_t number);

// The calling thread's last system error number.
uint32_t LastSystemError();

// Total physical memory in bytes. FRINGE_PHYSICAL_MEMORY (decimal bytes) or
// SetPhysicalMemoryOverride (non-zero) take the place of the machine's figure.
uint64_t TotalPhysicalMemory();
void SetPhysicalMemoryOverride(uint64_t bytes);

// Appends one line to the trace file at path. When replaceExisting is set the
// file is deleted first. The file is never reached through a symbolic link and
// must be a regular file; false when the line could not be written.
bool AppendTraceLine(const std::string& path, const std::string& line, bool replaceExisting);

// Where the trace file lives on this system for the given conventional path.
std::string TraceFilePath(const std::string& conventionalPath);

}  // namespace Vireo::Platform
