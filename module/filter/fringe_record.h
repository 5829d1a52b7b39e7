// The result record that the host keeps with the document: 18 bytes, nine
// signed 16-bit values in the module's byte order (corner 1 v, h, corner 2
// v, h, corner 3 v, h, corner 4 v, h, confidence), stored as type 'fRNG'.
#pragma once

#include <array>
#include <cstdint>

#include "filter/analysis/types.h"
#include "host/four_char_code.h"
#include "host/rastrix_filter.h"

namespace Project {

inline constexpr uint32_t kFringeRecordType = Vireo::FourCharCode("fRNG");
inline constexpr int32_t kFringeRecordBytes = 18;

using FringeRecord = std::array<uint8_t, kFringeRecordBytes>;

FringeRecord MakeFringeRecord(const CornerQuad& corners, int16_t confidence);

// Replaces the document's 'fRNG' records by one holding the given result.
void WriteFringeRecord(Vireo::CRastrixPlugin& plugin, const CornerQuad& corners,
                       int16_t confidence);

// The failure record: the corners of the whole document, confidence 0.
void WriteEmptyFringeRecord(Vireo::CRastrixFilter& filter);

}  // namespace Project
