// Zero-filled working arrays for the analysis, with a switch that lets tests
// make the next allocations fail so that every failure path can be reached.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <new>

namespace Project {

// Counts down the allocations still allowed to succeed; negative means no
// limit. Module-wide like the rest of the analysis state (one run at a time).
void LimitAnalysisAllocations(int32_t allowed);
void UnlimitAnalysisAllocations();
// True when the next allocation is to fail; consumes one allowance otherwise.
bool AnalysisAllocationRefused();

// A zero-filled array of count elements, or null when count is 0, the memory
// is not there or a test refused it.
template <typename T>
std::unique_ptr<T[]> AllocateZeroed(std::size_t count) {
  if (count == 0 || AnalysisAllocationRefused()) return nullptr;
  return std::unique_ptr<T[]>(new (std::nothrow) T[count]());
}

}  // namespace Project
