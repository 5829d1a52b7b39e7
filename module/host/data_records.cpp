// Document data records through the data-record procedures, and the
// replacement of a record type by one new record.
#include <cstring>

#include "core/rastrix_error.h"
#include "host/proc_table.h"
#include "host/rastrix_plugin.h"

namespace Vireo {

bool CRastrixPlugin::HasDataRecordProcs() const {
  const DataRecordProcTable* table = DataRecordProcs();
  return HasHandleProcs() && TableCount(table) >= 4 && TableComplete(table, 4);
}

int32_t CRastrixPlugin::CountDataRecords(uint32_t type) {
  const auto count = TableProc<CountDataRecordsProc>(DataRecordProcs(), 1);
  return count != nullptr ? count(type) : 0;
}

HostHandle CRastrixPlugin::GetDataRecord(uint32_t type, int16_t index) {
  const auto get = TableProc<GetDataRecordProc>(DataRecordProcs(), 2);
  return get != nullptr ? get(type, index) : nullptr;
}

void CRastrixPlugin::DeleteDataRecord(uint32_t type, int16_t index) {
  if (const auto remove = TableProc<DeleteDataRecordProc>(DataRecordProcs(), 3)) {
    remove(type, index);
  }
}

void CRastrixPlugin::AddDataRecord(uint32_t type, HostHandle handle) {
  const auto add = TableProc<AddDataRecordProc>(DataRecordProcs(), 4);
  if (add == nullptr) return;
  if (const int16_t error = add(type, handle); error != 0) throw CRastrixError(error);
}

void CRastrixPlugin::PublishDataRecord(uint32_t type, const void* bytes, int32_t size) {
  if (!HasDataRecordProcs()) return;
  const int32_t count = CountDataRecords(type);
  // No list has fewer than no records: the host could not count them, and a
  // record added now could sit beside ones that were never deleted.
  if (count < 0) throw CRastrixError(static_cast<int16_t>(count));
  // Downward, so that the indexes still to visit stay valid.
  for (int32_t index = count; index >= 1; --index) {
    const auto position = static_cast<int16_t>(index);
    if (GetDataRecord(type, position) != nullptr) DeleteDataRecord(type, position);
  }
  HostHandle handle = NewHostHandle(size);
  try {
    if (void* data = LockHostHandle(handle, false); data != nullptr) {
      std::memcpy(data, bytes, static_cast<size_t>(size));
      AddDataRecord(type, handle);
    }
  } catch (...) {
    // The host keeps its own copy only on success; ours must go either way,
    // even when a host procedure throws.
    UnlockHostHandle(handle);
    DisposeHostHandle(handle);
    throw;
  }
  UnlockHostHandle(handle);
  DisposeHostHandle(handle);
}

}  // namespace Vireo
