// The records the host passes with every call: the filter record for the
// filter selectors, the about record for the about selector, and the
// descriptor parameter block. Only the fields the module uses are named; the
// rest is kept as reserved bytes so that every field sits where the host puts
// it. The host packs them on 4-byte boundaries: 8-byte pointers may start at
// any multiple of 4.
#pragma once

#include <cstddef>
#include <cstdint>

#include "host/host_types.h"

namespace Vireo {

#pragma pack(push, 4)

struct HostRect {
  int16_t top;
  int16_t left;
  int16_t bottom;
  int16_t right;
};

struct HostPoint {
  int16_t v;
  int16_t h;
};

struct FilterRecord {
  uint8_t reserved0[4];
  AbortProc abortProc;        // 4
  ProgressProc progressProc;  // 12
  uint8_t reserved20[8];
  HostPoint documentSize;  // 28: rows, columns
  int16_t planes;          // 32
  HostRect filterRect;     // 34
  uint8_t reserved42[14];
  int32_t maxSpace;     // 56: largest memory budget
  int32_t bufferSpace;  // 60
  HostRect inRect;      // 64
  int16_t inLoPlane;    // 72
  int16_t inHiPlane;    // 74
  HostRect outRect;     // 76
  int16_t outLoPlane;   // 84
  int16_t outHiPlane;   // 86
  void* inData;         // 88
  int32_t inRowBytes;   // 96
  void* outData;        // 100
  int32_t outRowBytes;  // 108
  uint8_t reserved112[4];
  HostRect maskRect;  // 116
  uint8_t reserved124[20];
  uint32_t hostSignature;  // 144
  uint8_t reserved148[8];
  uint16_t imageMode;  // 156
  uint8_t reserved158[58];
  void* platformData;                          // 216
  const BufferProcTable* bufferProcs;          // 224
  const DataRecordProcTable* dataRecordProcs;  // 232
  uint8_t reserved240[16];
  const HandleProcTable* handleProcs;  // 256
  uint8_t reserved264[2];
  int16_t dataLayoutRequest;  // 266
  int16_t filterCase;         // 268
  uint8_t reserved270[10];
  AdvanceStateProc advanceState;  // 280
  uint8_t reserved288[24];
  int32_t inputRate;  // 312: 16.16 fixed point
  int32_t maskRate;   // 316: 16.16 fixed point
  uint8_t reserved320[48];
  int32_t inColumnBytes;   // 368
  int32_t outColumnBytes;  // 372
  uint8_t reserved376[16];
  const PropertyProcTable* propertyProcs;  // 392
  uint8_t reserved400[32];
  struct DescriptorParameters* descriptorParameters;  // 432
  uint8_t reserved440[24];
  const BasicSuiteTable* basicSuite;  // 464
  void* pluginRef;                    // 472
};

struct AboutRecord {
  void* platformData;                 // 0
  const BasicSuiteTable* basicSuite;  // 8
  void* pluginRef;                    // 16
};

struct DescriptorParameters {
  int16_t version;     // 0
  int16_t playInfo;    // 2
  int16_t recordInfo;  // 4
  uint8_t reserved6[2];
  HostHandle descriptor;                       // 8
  const WriteDescriptorProcTable* writeProcs;  // 16
  const void* readProcs;                       // 24
};

#pragma pack(pop)

static_assert(offsetof(FilterRecord, abortProc) == 4);
static_assert(offsetof(FilterRecord, progressProc) == 12);
static_assert(offsetof(FilterRecord, documentSize) == 28);
static_assert(offsetof(FilterRecord, planes) == 32);
static_assert(offsetof(FilterRecord, filterRect) == 34);
static_assert(offsetof(FilterRecord, maxSpace) == 56);
static_assert(offsetof(FilterRecord, bufferSpace) == 60);
static_assert(offsetof(FilterRecord, inRect) == 64);
static_assert(offsetof(FilterRecord, inLoPlane) == 72);
static_assert(offsetof(FilterRecord, inHiPlane) == 74);
static_assert(offsetof(FilterRecord, outRect) == 76);
static_assert(offsetof(FilterRecord, outLoPlane) == 84);
static_assert(offsetof(FilterRecord, outHiPlane) == 86);
static_assert(offsetof(FilterRecord, inData) == 88);
static_assert(offsetof(FilterRecord, inRowBytes) == 96);
static_assert(offsetof(FilterRecord, outData) == 100);
static_assert(offsetof(FilterRecord, outRowBytes) == 108);
static_assert(offsetof(FilterRecord, maskRect) == 116);
static_assert(offsetof(FilterRecord, hostSignature) == 144);
static_assert(offsetof(FilterRecord, imageMode) == 156);
static_assert(offsetof(FilterRecord, platformData) == 216);
static_assert(offsetof(FilterRecord, bufferProcs) == 224);
static_assert(offsetof(FilterRecord, dataRecordProcs) == 232);
static_assert(offsetof(FilterRecord, handleProcs) == 256);
static_assert(offsetof(FilterRecord, dataLayoutRequest) == 266);
static_assert(offsetof(FilterRecord, filterCase) == 268);
static_assert(offsetof(FilterRecord, advanceState) == 280);
static_assert(offsetof(FilterRecord, inputRate) == 312);
static_assert(offsetof(FilterRecord, maskRate) == 316);
static_assert(offsetof(FilterRecord, inColumnBytes) == 368);
static_assert(offsetof(FilterRecord, outColumnBytes) == 372);
static_assert(offsetof(FilterRecord, propertyProcs) == 392);
static_assert(offsetof(FilterRecord, descriptorParameters) == 432);
static_assert(offsetof(FilterRecord, basicSuite) == 464);
static_assert(offsetof(FilterRecord, pluginRef) == 472);
static_assert(sizeof(FilterRecord) == 480);

static_assert(offsetof(AboutRecord, platformData) == 0);
static_assert(offsetof(AboutRecord, basicSuite) == 8);
static_assert(offsetof(AboutRecord, pluginRef) == 16);

static_assert(offsetof(DescriptorParameters, recordInfo) == 4);
static_assert(offsetof(DescriptorParameters, descriptor) == 8);
static_assert(offsetof(DescriptorParameters, writeProcs) == 16);
static_assert(offsetof(DescriptorParameters, readProcs) == 24);

}  // namespace Vireo
