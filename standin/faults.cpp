// Call counting and the failure schedule of each procedure.
#include "standin/faults.h"

namespace Standin {

const char* ProcName(Proc proc) {
  switch (proc) {
    case Proc::Abort:
      return "abort test";
    case Proc::Progress:
      return "progress";
    case Proc::AdvanceState:
      return "advance state";
    case Proc::HandleNew:
      return "new handle";
    case Proc::HandleDispose:
      return "dispose handle";
    case Proc::HandleGetSize:
      return "get handle size";
    case Proc::HandleSetSize:
      return "set handle size";
    case Proc::HandleLock:
      return "lock handle";
    case Proc::HandleUnlock:
      return "unlock handle";
    case Proc::HandleRecoverSpace:
      return "recover space";
    case Proc::HandleRelease:
      return "release handle";
    case Proc::RecordCount:
      return "count records";
    case Proc::RecordGet:
      return "get record";
    case Proc::RecordDelete:
      return "delete record";
    case Proc::RecordAdd:
      return "add record";
    case Proc::PropertyGet:
      return "get property";
    case Proc::PropertySet:
      return "set property";
    case Proc::BufferAllocate:
      return "allocate buffer";
    case Proc::BufferLock:
      return "lock buffer";
    case Proc::BufferUnlock:
      return "unlock buffer";
    case Proc::BufferFree:
      return "free buffer";
    case Proc::BufferSpace:
      return "buffer space";
    case Proc::DescriptorOpen:
      return "open descriptor";
    case Proc::DescriptorClose:
      return "close descriptor";
    case Proc::DescriptorPutInteger:
      return "put integer";
    case Proc::DescriptorPutFloat:
      return "put float";
    case Proc::SuiteAcquire:
      return "acquire suite";
    case Proc::SuiteRelease:
      return "release suite";
    case Proc::SuiteBufferNew:
      return "buffer suite new";
    case Proc::SuiteBufferDispose:
      return "buffer suite dispose";
    case Proc::SuiteBufferSize:
      return "buffer suite size";
    case Proc::SuiteBufferSpace:
      return "buffer suite space";
  }
  return "unknown procedure";
}

void FaultPlan::FailAt(Proc proc, int32_t failAt, int32_t failTimes, int32_t error) {
  Entry& entry = Slot(proc);
  entry.fault.failAt = failAt;
  entry.fault.failTimes = failTimes;
  entry.fault.error = error;
  entry.fault.raise = false;
  entry.base = entry.calls;
}

void FaultPlan::RaiseAt(Proc proc, int32_t raiseAt) {
  FailAt(proc, raiseAt);
  Slot(proc).fault.raise = true;
}

void FaultPlan::Restore(Proc proc) {
  Entry& entry = Slot(proc);
  entry.fault = Fault{};
  entry.base = entry.calls;
}

std::optional<int32_t> FaultPlan::Count(Proc proc) {
  Entry& entry = Slot(proc);
  ++entry.calls;
  const Fault& fault = entry.fault;
  if (fault.failAt <= 0) return std::nullopt;
  int32_t nth = entry.calls - entry.base;
  if (nth < fault.failAt) return std::nullopt;
  if (fault.failTimes >= 0 && nth >= fault.failAt + fault.failTimes) return std::nullopt;
  if (fault.raise) {
    throw HostRaised(std::string("the host's ") + ProcName(proc) + " raised an exception");
  }
  return fault.error;
}

void FaultPlan::ResetCalls() {
  for (Entry& entry : procs_) {
    entry.base -= entry.calls;
    entry.calls = 0;
  }
}

}  // namespace Standin
