// The virtual heap's share of memory: between 32 MiB and 3 GiB, at most half
// the machine's memory (unless that is below 32 MiB) and at most the buffer
// space left to the framework.
#pragma once

#include <cstdint>

namespace Vireo {

inline constexpr std::uint64_t kMinTileBudget = 33554432;    // 32 MiB
inline constexpr std::uint64_t kMaxTileBudget = 3221225472;  // 3 GiB

// `bufferSpace` is the filter record's buffer-space field as stored (a signed
// 32-bit value whose bits are compared unsigned).
std::uint64_t ComputeTileBudget(std::uint64_t physicalMemory, std::uint32_t bufferSpace);

}  // namespace Vireo
