// The allocator that the framework's tile heap draws its blocks from, and the
// one module-wide slot that owns the installed allocator.
#pragma once

#include <cstdint>

namespace Vireo {

class CVirtualAllocator {
 public:
  CVirtualAllocator() = default;
  CVirtualAllocator(const CVirtualAllocator&) = delete;
  CVirtualAllocator& operator=(const CVirtualAllocator&) = delete;
  virtual ~CVirtualAllocator() = default;
  virtual void* Allocate(uint32_t size) = 0;
  virtual void Free(void* block) = 0;
};

// Destroys the allocator installed before, then installs the given one (which
// the slot now owns); null leaves no allocator.
void InstallTileAllocator(CVirtualAllocator* allocator);

// The installed allocator, or null.
CVirtualAllocator* InstalledTileAllocator();

}  // namespace Vireo
