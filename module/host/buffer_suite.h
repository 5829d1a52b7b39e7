// The host's buffer suite ("Rastrix Buffer Suite for Plug-ins", version 1), of
// which the module calls the first two procedures.
#pragma once

#include <cstdint>

#include "host/proc_table.h"

namespace Vireo {

inline constexpr const char* kBufferSuiteName = "Rastrix Buffer Suite for Plug-ins";
inline constexpr std::int32_t kBufferSuiteVersion = 1;

inline constexpr int kBufferSuiteNewPosition = 1;
inline constexpr int kBufferSuiteDisposePosition = 2;
// A buffer of *requestedSize bytes (at least minimumSize), or null.
using BufferSuiteNewProc = void* (*)(std::uint32_t* requestedSize, std::uint32_t minimumSize);
// Gives a buffer back; takes the address of the buffer pointer.
using BufferSuiteDisposeProc = void (*)(void** buffer);

}  // namespace Vireo
