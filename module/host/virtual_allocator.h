// Vireo::CVirtualAllocator: where the framework's virtual heap takes its tile
// blocks from when it does not use the process heap.
#pragma once

#include <cstdint>

namespace Vireo {

class CVirtualAllocator {
 public:
  CVirtualAllocator() = default;
  CVirtualAllocator(const CVirtualAllocator&) = delete;
  CVirtualAllocator& operator=(const CVirtualAllocator&) = delete;
  virtual ~CVirtualAllocator() = default;

  // A block of at least `size` bytes, or null.
  virtual void* Allocate(std::uint32_t size) = 0;
  // Gives back a block from Allocate; null is ignored.
  virtual void Free(void* block) = 0;
};

}  // namespace Vireo
