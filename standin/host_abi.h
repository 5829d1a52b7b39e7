// The host's side of the plug-in interface as this stand-in offers it: the
// shapes of every procedure it hands to a module, and the byte offsets of every
// record field it writes or reads. Written from the host's point of view only;
// nothing here comes from the module's own headers, so a module that puts a
// field elsewhere fails a test instead of agreeing with itself.
#pragma once

#include <cstddef>
#include <cstdint>

namespace Standin::Abi {

using Handle = void*;
using BufferId = void*;
using WriteToken = void*;

// Filter record callbacks.
using AbortProc = uint8_t (*)();
using ProgressProc = void (*)(int32_t done, int32_t total);
using AdvanceStateProc = int16_t (*)();

// Handle procedures, by position.
using NewHandleProc = Handle (*)(int32_t size);                      // 1
using DisposeHandleProc = void (*)(Handle handle);                   // 2
using GetHandleSizeProc = int32_t (*)(Handle handle);                // 3
using SetHandleSizeProc = int16_t (*)(Handle handle, int32_t size);  // 4
using LockHandleProc = void* (*)(Handle handle, uint8_t moveHigh);   // 5
using UnlockHandleProc = void (*)(Handle handle);                    // 6
using RecoverSpaceProc = void (*)(int32_t size);                     // 7
using ReleaseHandleProc = void (*)(Handle handle);                   // 8

// Data-record procedures, by position; indexes are 1-based.
using CountRecordsProc = int16_t (*)(uint32_t type);              // 1
using GetRecordProc = Handle (*)(uint32_t type, int16_t index);   // 2
using DeleteRecordProc = void (*)(uint32_t type, int16_t index);  // 3
using AddRecordProc = int16_t (*)(uint32_t type, Handle handle);  // 4

// Property procedures.
using GetPropertyProc = int16_t (*)(uint32_t signature, uint32_t key, int32_t index,
                                    intptr_t* simple, Handle* complex);  // 1
using SetPropertyProc = int16_t (*)(uint32_t signature, uint32_t key, int32_t index,
                                    intptr_t simple, Handle complex);  // 2

// Buffer procedures of the filter record.
using AllocateBufferProc = int16_t (*)(int32_t size, BufferId* id);  // 1
using LockBufferProc = void* (*)(BufferId id, uint8_t moveHigh);     // 2
using UnlockBufferProc = void (*)(BufferId id);                      // 3
using FreeBufferProc = void (*)(BufferId id);                        // 4
using BufferSpaceProc = int32_t (*)();                               // 5

// Descriptor write procedures.
using OpenWriteProc = WriteToken (*)();                                                 // 1
using CloseWriteProc = int16_t (*)(WriteToken token, Handle* descriptor);               // 2
using PutIntegerProc = int16_t (*)(WriteToken token, uint32_t key, int32_t value);      // 3
using PutFloatProc = int16_t (*)(WriteToken token, uint32_t key, const double* value);  // 4

// The basic suite: a plain list of procedure pointers.
using AcquireSuiteProc = int32_t (*)(const char* name, int32_t version, const void** suite);
using ReleaseSuiteProc = int32_t (*)(const char* name, int32_t version);

// The buffer suite, version 1.
using SuiteNewBufferProc = void* (*)(uint32_t* requestedSize, uint32_t minimumSize);  // 1
using SuiteDisposeBufferProc = void (*)(void** buffer);                               // 2
using SuiteBufferSizeProc = uint32_t (*)(void* buffer);                               // 3
using SuiteBufferSpaceProc = uint32_t (*)();                                          // 4

// Procedure tables: 16-bit version, 16-bit count, then 8-byte pointers packed on
// 4-byte boundaries, the first at offset 4.
constexpr size_t kTableVersion = 0;
constexpr size_t kTableCount = 2;
constexpr size_t kTableFirstProc = 4;
constexpr size_t kTableProcStride = 8;

// The filter record: fields packed on 4-byte boundaries.
namespace Filter {
constexpr size_t kSize = 480;
constexpr size_t kAbortProc = 4;
constexpr size_t kProgressProc = 12;
constexpr size_t kImageRows = 28;
constexpr size_t kImageColumns = 30;
constexpr size_t kPlanes = 32;
constexpr size_t kFilterRect = 34;  // top, left, bottom, right (16-bit each)
constexpr size_t kMaxSpace = 56;
constexpr size_t kBufferSpace = 60;
constexpr size_t kInRect = 64;
constexpr size_t kInLoPlane = 72;
constexpr size_t kInHiPlane = 74;
constexpr size_t kOutRect = 76;
constexpr size_t kOutLoPlane = 84;
constexpr size_t kOutHiPlane = 86;
constexpr size_t kInData = 88;
constexpr size_t kInRowBytes = 96;
constexpr size_t kOutData = 100;
constexpr size_t kOutRowBytes = 108;
constexpr size_t kMaskRect = 116;
constexpr size_t kHostSignature = 144;
constexpr size_t kImageMode = 156;
constexpr size_t kPlatformData = 216;
constexpr size_t kBufferProcs = 224;
constexpr size_t kRecordProcs = 232;
constexpr size_t kHandleProcs = 256;
constexpr size_t kWantLayout = 266;
constexpr size_t kFilterCase = 268;
constexpr size_t kAdvanceState = 280;
constexpr size_t kInputRate = 312;
constexpr size_t kMaskRate = 316;
constexpr size_t kInColumnBytes = 368;
constexpr size_t kOutColumnBytes = 372;  // the output's own column distance
constexpr size_t kPropertyProcs = 392;
constexpr size_t kDescriptorParameters = 432;
constexpr size_t kBasicSuite = 464;
constexpr size_t kPluginRef = 472;
}  // namespace Filter

// The record passed with the about selector.
namespace About {
constexpr size_t kSize = 24;
constexpr size_t kPlatformData = 0;
constexpr size_t kBasicSuite = 8;
constexpr size_t kPluginRef = 16;
}  // namespace About

// The descriptor parameter block.
namespace DescriptorParameters {
constexpr size_t kSize = 32;
constexpr size_t kRecordInfo = 4;
constexpr size_t kDescriptor = 8;
constexpr size_t kWriteProcs = 16;
constexpr size_t kReadProcs = 24;
}  // namespace DescriptorParameters

// The platform data: its first word is the host's main window.
namespace PlatformData {
constexpr size_t kSize = 16;
constexpr size_t kMainWindow = 0;
}  // namespace PlatformData

// Host result codes the stand-in answers with.
constexpr int16_t kNoError = 0;
constexpr int16_t kParamError = -50;
constexpr int16_t kMemoryFull = -108;
constexpr int16_t kNilHandle = -109;
constexpr int16_t kPropertyUndefined = -1;  // a property the host does not know

}  // namespace Standin::Abi
