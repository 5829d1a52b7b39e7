// The module's one exported function, through which the host makes every call.
#pragma once

#include <cstdint>

#if defined(_WIN32)
#define FRINGE_EXPORT __declspec(dllexport)
#else
#define FRINGE_EXPORT __attribute__((visibility("default")))
#endif

extern "C" {
// selector: 0 about, 1 parameters, 2 prepare, 3 start, 4 continue, 5 finish.
// record: the filter record (the about record for selector 0). dataSlot: the
// host's per-plug-in slot, never touched. result: receives 0 on success, a
// host code, or 1 once the user has been told of the failure.
FRINGE_EXPORT void ENTRYPOINT1(int16_t selector, void* record, intptr_t* dataSlot, int16_t* result);
}
