// The Windows side of the seam: version test, display scaling, common
// controls, threads, handles, alerts, beeps, system messages and memory.
#include <windows.h>
// windows.h first: commctrl.h depends on it.
#include <commctrl.h>

#include "platform/alert_log.h"
#include "platform/platform.h"
#include "platform/system_side.h"
#include "platform/windows/activation_context.h"
#include "platform/windows/wide_text.h"

namespace Vireo::Platform {

namespace Side {

uint64_t QueryPhysicalMemory() {
  MEMORYSTATUSEX status{};
  status.dwLength = sizeof status;
  if (GlobalMemoryStatusEx(&status) == FALSE) return 0;
  return status.ullTotalPhys;
}

void FillProcessHandles(ProcessHandles& handles, void* moduleInstance) {
  handles.moduleInstance = moduleInstance;
  handles.hostModule = GetModuleHandleW(nullptr);
  handles.processHeap = GetProcessHeap();
}

}  // namespace Side

bool IsSystemVersionAtLeast(uint32_t major, uint32_t minor, uint16_t servicePack) {
  OSVERSIONINFOEXW wanted{};
  wanted.dwOSVersionInfoSize = sizeof wanted;
  wanted.dwMajorVersion = major;
  wanted.dwMinorVersion = minor;
  wanted.wServicePackMajor = servicePack;
  ULONGLONG condition = 0;
  condition = VerSetConditionMask(condition, VER_MAJORVERSION, VER_GREATER_EQUAL);
  condition = VerSetConditionMask(condition, VER_MINORVERSION, VER_GREATER_EQUAL);
  condition = VerSetConditionMask(condition, VER_SERVICEPACKMAJOR, VER_GREATER_EQUAL);
  return VerifyVersionInfoW(&wanted, VER_MAJORVERSION | VER_MINORVERSION | VER_SERVICEPACKMAJOR,
                            condition) != FALSE;
}

void MakeProcessDpiAware() {
  const ScopedModuleActivation activation;
  HMODULE user = LoadLibraryW(L"user32.dll");
  if (user == nullptr) return;
  using SetAwareProc = BOOL(WINAPI*)();
  // The exported address is cast to its documented signature.
  auto setAware = reinterpret_cast<SetAwareProc>(
      reinterpret_cast<void*>(GetProcAddress(user, "SetProcessDPIAware")));
  if (setAware != nullptr) setAware();
  FreeLibrary(user);
}

void InitCommonControls() {
  const ScopedModuleActivation activation;
  INITCOMMONCONTROLSEX classes{};
  classes.dwSize = 8;
  classes.dwICC = 0x7FF;
  InitCommonControlsEx(&classes);
}

uint32_t CurrentThreadId() {
  return GetCurrentThreadId();
}

WindowHandle ActiveWindow() {
  return GetActiveWindow();
}

void ShowErrorAlert(WindowHandle owner, const std::string& title, const std::string& message) {
  if (DivertAlert(title, message)) return;
  auto* window = static_cast<HWND>(owner);
  // OK button, stop icon, task-modal, brought to the foreground.
  constexpr UINT kWideFlags = 0x12010;
  constexpr UINT kNarrowFlags = 0x02010;
  if (IsSystemVersionAtLeast(5, 1, 0)) {
    MessageBoxW(window, WideFromUtf8(message).c_str(), WideFromUtf8(title).c_str(), kWideFlags);
  } else {
    MessageBoxA(window, message.c_str(), title.c_str(), kNarrowFlags);
  }
}

void BeepExclamation() {
  if (DivertBeep()) return;
  MessageBeep(MB_ICONEXCLAMATION);
}

std::string SystemMessageText(uint32_t number) {
  constexpr DWORD kDefaultLanguage = 1024;
  wchar_t buffer[256] = {};
  const DWORD count = FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS,
                                     nullptr, number, kDefaultLanguage, buffer, 256, nullptr);
  std::wstring text(buffer, count);
  // System texts end with a line break that has no place inside an alert.
  while (!text.empty() && (text.back() == L'\n' || text.back() == L'\r' || text.back() == L' ')) {
    text.pop_back();
  }
  return Utf8FromWide(text);
}

uint32_t LastSystemError() {
  return GetLastError();
}

}  // namespace Vireo::Platform
