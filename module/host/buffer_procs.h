// The buffer procedures of the filter record (after the table's 16-bit version
// and count), by position.
#pragma once

#include <cstdint>

namespace Vireo {

// An opaque, host-owned buffer.
using HostBufferId = void*;

inline constexpr int kBufferProcCount = 5;
using AllocateBufferProc = int16_t (*)(int32_t size, HostBufferId* id);  // 1
using LockBufferProc = void* (*)(HostBufferId id, uint8_t moveHigh);     // 2
using UnlockBufferProc = void (*)(HostBufferId id);                      // 3
using FreeBufferProc = void (*)(HostBufferId id);                        // 4
using BufferSpaceProc = int32_t (*)();                                   // 5

}  // namespace Vireo
