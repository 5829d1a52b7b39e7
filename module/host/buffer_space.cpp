// Sharing out the host's memory budget at prepare: one part for the
// framework's heap, the rest handed back to the host for the filter's use.
#include <algorithm>

#include "core/error.h"
#include "host/rastrix_filter.h"

namespace Vireo {
namespace {
constexpr uint32_t kFloorCap = 0x80000;  // 512 KiB
}

bool CRastrixFilter::NegotiateBufferSpace() {
  FilterRecord& record = AttachedRecord();
  const auto total = static_cast<uint32_t>(record.maxSpace);
  uint32_t first = total >> 1;
  uint32_t second = total - first;
  if (!SplitBufferSpace(total, first, second)) {
    throw CError::WithReason(
        "$$$/Vireo/RastrixPlugin/Error/NotEnoughMemory=This plugin requires more memory than the "
        "host can currently supply.");
  }
  const uint32_t floor = std::min(total >> 1, kFloorCap);
  const uint32_t firstShare = first < floor ? floor : std::min(first, total - floor);
  const uint32_t secondShare = second < floor ? floor : std::min(second, total - firstShare);
  record.maxSpace = static_cast<int32_t>(firstShare + secondShare);
  record.bufferSpace = static_cast<int32_t>(firstShare);
  SetUpMemory();
  if (UsesBufferSuite()) {
    record.maxSpace = static_cast<int32_t>(secondShare);
    record.bufferSpace = 0;
  }
  return true;
}

}  // namespace Vireo
