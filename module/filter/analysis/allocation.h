// Zero-filled working arrays for the analysis, with switches that let tests
// make allocations fail so that every failure path and every slower road can
// be reached.
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

// Workspaces only make a stage faster: a stage that cannot have one takes a
// slower road to the same result. They are kept apart from the allocations
// above, whose failures the stages report, and tests refuse them separately.
void RefuseWorkspaces(bool refuse);
bool WorkspacesRefused();

// A zero-filled workspace of count elements, or null (count 0, no memory,
// or refused by a test).
template <typename T>
std::unique_ptr<T[]> AllocateWorkspace(std::size_t count) {
  if (count == 0 || WorkspacesRefused()) return nullptr;
  return std::unique_ptr<T[]>(new (std::nothrow) T[count]());
}

}  // namespace Project
