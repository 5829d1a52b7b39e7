// The procedures the host hands to a module, as plain functions that find the
// host of the call in progress, and the tables that carry them.
#pragma once

#include <memory>
#include <vector>

#include "standin/byte_block.h"
#include "standin/faults.h"

namespace Standin {

struct HostProcs {
  // The procedure's address, or null when the fault plan removes it.
  static void* Address(Proc proc, const FaultPlan& faults);
  // The table as the record points to it, or null when the plan leaves it out:
  // 16-bit version, 16-bit count, 8-byte pointers (the basic suite: pointers only).
  static std::unique_ptr<ByteBlock> BuildTable(Table table, const FaultPlan& faults);
  // The buffer suite's procedure list.
  static std::vector<void*> BufferSuite(const FaultPlan& faults);
  // The procedures of a table in position order.
  static std::vector<Proc> TableProcs(Table table);
};

}  // namespace Standin
