// Host handles through the handle procedures.
#include "core/rastrix_error.h"
#include "host/proc_table.h"
#include "host/rastrix_plugin.h"

namespace Vireo {

bool CRastrixPlugin::HasHandleProcs() const {
  const HandleProcTable* table = HandleProcs();
  return TableCount(table) >= 7 && TableComplete(table, 7);
}

HostHandle CRastrixPlugin::NewHostHandle(int32_t size) {
  const auto newHandle = TableProc<NewHandleProc>(HandleProcs(), 1);
  HostHandle handle = newHandle != nullptr ? newHandle(size) : nullptr;
  if (handle == nullptr) throw CRastrixError(kMemFullErr);
  return handle;
}

void CRastrixPlugin::DisposeHostHandle(HostHandle handle) {
  if (handle == nullptr) return;
  if (const auto dispose = TableProc<DisposeHandleProc>(HandleProcs(), 2)) dispose(handle);
}

void CRastrixPlugin::ReleaseHostHandle(HostHandle handle) {
  if (handle == nullptr) return;
  const int position = TableCount(HandleProcs()) >= 8 ? 8 : 2;
  if (const auto dispose = TableProc<DisposeHandleProc>(HandleProcs(), position)) dispose(handle);
}

int32_t CRastrixPlugin::GetHostHandleSize(HostHandle handle) {
  const auto getSize = TableProc<GetHandleSizeProc>(HandleProcs(), 3);
  return getSize != nullptr ? getSize(handle) : 0;
}

void CRastrixPlugin::SetHostHandleSize(HostHandle handle, int32_t size) {
  const auto setSize = TableProc<SetHandleSizeProc>(HandleProcs(), 4);
  if (setSize == nullptr) return;
  if (const int16_t error = setSize(handle, size); error != 0) throw CRastrixError(error);
}

void* CRastrixPlugin::LockHostHandle(HostHandle handle, bool moveHigh) {
  const auto lock = TableProc<LockHandleProc>(HandleProcs(), 5);
  return lock != nullptr ? lock(handle, moveHigh ? 1 : 0) : nullptr;
}

void CRastrixPlugin::UnlockHostHandle(HostHandle handle) {
  if (const auto unlock = TableProc<UnlockHandleProc>(HandleProcs(), 6)) unlock(handle);
}

}  // namespace Vireo
