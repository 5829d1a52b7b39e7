// Fault injection: every procedure the host offers can be removed (its pointer
// left null) or made to fail from its N-th call on, and every procedure table
// can be left out or given a shorter count. The host counts every call.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>

namespace Standin {

enum class Proc : int {
  Abort,
  Progress,
  AdvanceState,
  HandleNew,
  HandleDispose,
  HandleGetSize,
  HandleSetSize,
  HandleLock,
  HandleUnlock,
  HandleRecoverSpace,
  HandleRelease,
  RecordCount,
  RecordGet,
  RecordDelete,
  RecordAdd,
  PropertyGet,
  PropertySet,
  BufferAllocate,
  BufferLock,
  BufferUnlock,
  BufferFree,
  BufferSpace,
  DescriptorOpen,
  DescriptorClose,
  DescriptorPutInteger,
  DescriptorPutFloat,
  SuiteAcquire,
  SuiteRelease,
  SuiteBufferNew,
  SuiteBufferDispose,
  SuiteBufferSize,
  SuiteBufferSpace,
};
constexpr int kProcCount = static_cast<int>(Proc::SuiteBufferSpace) + 1;

const char* ProcName(Proc proc);

// The tables a record points to. Leaving one out writes a null pointer.
enum class Table : int {
  Handle,
  DataRecord,
  Property,
  Buffer,
  DescriptorWrite,
  DescriptorParameters,  // the parameter block itself
  BasicSuite,
  PlatformData,
};
constexpr int kTableCount = static_cast<int>(Table::PlatformData) + 1;

struct TableShape {
  bool absent = false;
  std::optional<int16_t> count;  // the count written instead of the full one
};

// What a failing procedure does: procedures answering a code answer `error`;
// those answering a pointer or handle answer null; the abort test answers
// "cancel"; procedures without a result do nothing.
struct Fault {
  bool removed = false;
  int32_t failAt = 0;     // 1-based call (counted from when the fault was set); 0: never
  int32_t failTimes = 1;  // calls failing from there on; negative: all later calls
  int32_t error = -108;
  // Instead of answering, the failing call throws HostRaised into the module:
  // a host written in C++ that lets an exception escape from a callback.
  bool raise = false;
};

// What a procedure scheduled to raise throws.
class HostRaised : public std::runtime_error {
 public:
  explicit HostRaised(const std::string& what) : std::runtime_error(what) {}
};

class FaultPlan {
 public:
  void Remove(Proc proc) { Slot(proc).fault.removed = true; }
  // Puts the procedure back and clears its failure schedule.
  void Restore(Proc proc);
  // Makes calls failAt, failAt + 1, ... (failTimes of them; all when negative) fail.
  void FailAt(Proc proc, int32_t failAt, int32_t failTimes = 1, int32_t error = -108);
  // Makes call `raiseAt` throw HostRaised out of the procedure.
  void RaiseAt(Proc proc, int32_t raiseAt);

  void SetTable(Table table, TableShape shape) { tables_[static_cast<size_t>(table)] = shape; }
  const TableShape& Shape(Table table) const { return tables_[static_cast<size_t>(table)]; }

  bool Removed(Proc proc) const { return Slot(proc).fault.removed; }
  // Counts one call of `proc`; answers the error to fail it with, if it fails,
  // or throws HostRaised when the failure is to raise.
  std::optional<int32_t> Count(Proc proc);
  int32_t Calls(Proc proc) const { return Slot(proc).calls; }
  void ResetCalls();

 private:
  struct Entry {
    Fault fault;
    int32_t base = 0;   // calls counted when the fault was set
    int32_t calls = 0;  // every call since the host began or counts were reset
  };
  Entry& Slot(Proc proc) { return procs_[static_cast<size_t>(proc)]; }
  const Entry& Slot(Proc proc) const { return procs_[static_cast<size_t>(proc)]; }

  std::array<Entry, kProcCount> procs_{};
  std::array<TableShape, kTableCount> tables_{};
};

}  // namespace Standin
