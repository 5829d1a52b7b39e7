// Building and storing the result record.
#include "filter/fringe_record.h"

#include <cstring>

#include "core/rastrix_error.h"

namespace Project {

FringeRecord MakeFringeRecord(const CornerQuad& corners, int16_t confidence) {
  const int16_t values[9] = {corners.corner[0].v, corners.corner[0].h, corners.corner[1].v,
                             corners.corner[1].h, corners.corner[2].v, corners.corner[2].h,
                             corners.corner[3].v, corners.corner[3].h, confidence};
  static_assert(sizeof values == kFringeRecordBytes);
  FringeRecord record{};
  std::memcpy(record.data(), values, sizeof values);
  return record;
}

void WriteFringeRecord(Vireo::CRastrixPlugin& plugin, const CornerQuad& corners,
                       int16_t confidence) {
  const FringeRecord record = MakeFringeRecord(corners, confidence);
  plugin.PublishDataRecord(kFringeRecordType, record.data(), kFringeRecordBytes);
}

void WriteEmptyFringeRecord(Vireo::CRastrixFilter& filter) {
  const Vireo::FilterRecord* host = filter.GetFilterRecord();
  if (host == nullptr) throw Vireo::CRastrixError(Vireo::kParamErr);
  const int16_t lastRow = static_cast<int16_t>(host->documentSize.v - 1);
  const int16_t lastColumn = static_cast<int16_t>(host->documentSize.h - 1);
  CornerQuad whole;
  whole.corner[0] = {0, 0};
  whole.corner[1] = {0, lastColumn};
  whole.corner[2] = {lastRow, lastColumn};
  whole.corner[3] = {lastRow, 0};
  WriteFringeRecord(filter, whole, 0);
}

}  // namespace Project
