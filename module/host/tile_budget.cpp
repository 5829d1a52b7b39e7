// The virtual heap's share of memory.
#include "host/tile_budget.h"

#include <algorithm>

namespace Vireo {

std::uint64_t ComputeTileBudget(std::uint64_t physicalMemory, std::uint32_t bufferSpace) {
  const std::uint64_t halfRam = physicalMemory / 2;
  const std::uint64_t heapLimit =
      halfRam < kMinTileBudget ? kMinTileBudget : std::min(halfRam, kMaxTileBudget);
  // A negative space reads as a large unsigned one and is held to 3 GiB.
  const std::uint64_t space = bufferSpace;
  const std::uint64_t spaceLimit =
      space < kMinTileBudget ? kMinTileBudget : std::min(space, kMaxTileBudget);
  return std::min(heapLimit, spaceLimit);
}

}  // namespace Vireo
