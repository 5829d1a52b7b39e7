// What each platform side supplies to the shared parts of the seam.
#pragma once

#include <cstdint>

#include "platform/platform.h"

namespace Vireo::Platform::Side {

// The machine's total physical memory in bytes, 0 when unknown.
uint64_t QueryPhysicalMemory();

// Fills the host module and process heap beside the given module instance.
void FillProcessHandles(ProcessHandles& handles, void* moduleInstance);

}  // namespace Vireo::Platform::Side
