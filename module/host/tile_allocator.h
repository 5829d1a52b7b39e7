// The allocator that the framework's tile heap draws its blocks from, and the
// one module-wide slot that owns the installed allocator.
#pragma once

#include <cstdint>
#include <memory>

namespace Vireo {

class CVirtualAllocator {
 public:
  CVirtualAllocator() = default;
  CVirtualAllocator(const CVirtualAllocator&) = delete;
  CVirtualAllocator& operator=(const CVirtualAllocator&) = delete;
  virtual ~CVirtualAllocator() = default;
  // A block of at least `size` bytes, or null.
  virtual void* Allocate(uint32_t size) = 0;
  // Gives back a block from Allocate; null is ignored.
  virtual void Free(void* block) = 0;
};

// Destroys the allocator installed before, then installs the given one (which
// the slot now owns); null leaves no allocator. Blocks still drawn from the
// old allocator keep it alive until they have been given back to it.
void InstallTileAllocator(CVirtualAllocator* allocator);

// The installed allocator, or null.
CVirtualAllocator* InstalledTileAllocator();

// The installed allocator as shared by the blocks drawn from it, or null.
std::shared_ptr<CVirtualAllocator> SharedTileAllocator();

}  // namespace Vireo
