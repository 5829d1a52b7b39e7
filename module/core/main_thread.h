// The framework's main thread: the thread that most recently created the
// filter object at the entry point.
#pragma once

#include <cstdint>

namespace Vireo {

void SetMainThreadId(uint32_t id);
uint32_t MainThreadId();
bool IsMainThread();

}  // namespace Vireo
