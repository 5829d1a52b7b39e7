// The entry point and, on Windows, the library's load notifications.
#include "host/entry_point.h"

#include "host/dispatcher.h"
#include "platform/platform.h"

#if defined(_WIN32)
#include <windows.h>
#endif

extern "C" FRINGE_EXPORT void ENTRYPOINT1(int16_t selector, void* record, intptr_t* dataSlot,
                                          int16_t* result) {
  // Without a result word the host could not learn what happened: do nothing.
  if (result == nullptr) return;
  *result = 0;
  Vireo::RunFilterSelector(selector, record, dataSlot, result, 0);
}

#if defined(_WIN32)
extern "C" BOOL WINAPI DllMain(HINSTANCE instance, DWORD reason, LPVOID /*reserved*/) {
  if (reason == DLL_PROCESS_ATTACH) Vireo::Platform::RecordProcessHandles(instance);
  return TRUE;
}
#endif
