// The allocation limit behind AllocateZeroed and the workspace switch.
#include "filter/analysis/allocation.h"

namespace Project {
namespace {
int32_t allowedAllocations = -1;
bool workspacesRefused = false;
}  // namespace

void LimitAnalysisAllocations(int32_t allowed) {
  allowedAllocations = allowed < 0 ? -1 : allowed;
}

void UnlimitAnalysisAllocations() {
  allowedAllocations = -1;
}

bool AnalysisAllocationRefused() {
  if (allowedAllocations < 0) return false;
  if (allowedAllocations == 0) return true;
  --allowedAllocations;
  return false;
}

void RefuseWorkspaces(bool refuse) {
  workspacesRefused = refuse;
}

bool WorkspacesRefused() {
  return workspacesRefused;
}

}  // namespace Project
