// Host buffers through the filter record's buffer procedures.
#include "core/rastrix_error.h"
#include "host/proc_table.h"
#include "host/rastrix_plugin.h"

namespace Vireo {

bool CRastrixPlugin::HasBufferProcs() const {
  const BufferProcTable* table = BufferProcs();
  return TableCount(table) >= kBufferProcCount && TableComplete(table, kBufferProcCount);
}

HostBufferId CRastrixPlugin::AllocateHostBuffer(int32_t size) {
  const auto allocate = TableProc<AllocateBufferProc>(BufferProcs(), 1);
  if (allocate == nullptr) throw CRastrixError(kMemFullErr);
  HostBufferId id = nullptr;
  if (const int16_t error = allocate(size, &id); error != 0) throw CRastrixError(error);
  if (id == nullptr) throw CRastrixError(kMemFullErr);
  return id;
}

void* CRastrixPlugin::LockHostBuffer(HostBufferId id, bool moveHigh) {
  const auto lock = TableProc<LockBufferProc>(BufferProcs(), 2);
  return lock != nullptr ? lock(id, moveHigh ? 1 : 0) : nullptr;
}

void CRastrixPlugin::UnlockHostBuffer(HostBufferId id) {
  if (const auto unlock = TableProc<UnlockBufferProc>(BufferProcs(), 3)) unlock(id);
}

void CRastrixPlugin::FreeHostBuffer(HostBufferId id) {
  if (id == nullptr) return;
  if (const auto release = TableProc<FreeBufferProc>(BufferProcs(), 4)) release(id);
}

int32_t CRastrixPlugin::GetHostBufferSpace() {
  const auto space = TableProc<BufferSpaceProc>(BufferProcs(), 5);
  return space != nullptr ? space() : 0;
}

}  // namespace Vireo
