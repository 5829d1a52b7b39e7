// The module-wide tile allocator slot.
#include "host/tile_allocator.h"

#include <memory>

namespace Vireo {
namespace {
std::unique_ptr<CVirtualAllocator> g_tileAllocator;
}

void InstallTileAllocator(CVirtualAllocator* allocator) {
  g_tileAllocator.reset();
  g_tileAllocator.reset(allocator);
}

CVirtualAllocator* InstalledTileAllocator() {
  return g_tileAllocator.get();
}

}  // namespace Vireo
