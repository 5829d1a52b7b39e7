// The host's procedure signatures and opaque handle types, as the host calls
// and is called. Procedure tables are opaque: they are read only by position
// through TableProc (host/proc_table.h).
#pragma once

#include <cstdint>

namespace Vireo {

// An opaque, host-owned memory block.
using HostHandle = void*;

// Procedure tables the filter record points to; never dereferenced directly.
struct BufferProcTable;
struct DataRecordProcTable;
struct HandleProcTable;
struct PropertyProcTable;
struct BasicSuiteTable;
struct WriteDescriptorProcTable;

// Callbacks of the filter record.
using AbortProc = uint8_t (*)();
using ProgressProc = void (*)(int32_t done, int32_t total);
using AdvanceStateProc = int16_t (*)();

// Handle procedures, by position.
using NewHandleProc = HostHandle (*)(int32_t size);                      // 1
using DisposeHandleProc = void (*)(HostHandle handle);                   // 2 and 8
using GetHandleSizeProc = int32_t (*)(HostHandle handle);                // 3
using SetHandleSizeProc = int16_t (*)(HostHandle handle, int32_t size);  // 4
using LockHandleProc = void* (*)(HostHandle handle, uint8_t moveHigh);   // 5
using UnlockHandleProc = void (*)(HostHandle handle);                    // 6
using RecoverSpaceProc = void (*)(int32_t size);                         // 7

// Data-record procedures, by position.
using CountDataRecordsProc = int16_t (*)(uint32_t type);                  // 1
using GetDataRecordProc = HostHandle (*)(uint32_t type, int16_t index);   // 2
using DeleteDataRecordProc = void (*)(uint32_t type, int16_t index);      // 3
using AddDataRecordProc = int16_t (*)(uint32_t type, HostHandle handle);  // 4

// Property procedures, by position.
using GetPropertyProc = int16_t (*)(uint32_t signature, uint32_t key, int32_t index,
                                    intptr_t* simpleValue, HostHandle* complexValue);  // 1
using SetPropertyProc = int16_t (*)(uint32_t signature, uint32_t key, int32_t index,
                                    intptr_t simpleValue, HostHandle complexValue);  // 2

// The basic suite, by position (a plain list of pointers, like every suite).
using AcquireSuiteProc = int32_t (*)(const char* name, int32_t version, const void** suite);  // 1
using ReleaseSuiteProc = int32_t (*)(const char* name, int32_t version);                      // 2

// Descriptor write procedures, by position.
using OpenWriteDescriptorProc = void* (*)();                                        // 1
using CloseWriteDescriptorProc = int16_t (*)(void* token, HostHandle* descriptor);  // 2
using PutIntegerProc = int16_t (*)(void* token, uint32_t key, int32_t value);       // 3
using PutFloatProc = int16_t (*)(void* token, uint32_t key, const double* value);   // 4

}  // namespace Vireo
