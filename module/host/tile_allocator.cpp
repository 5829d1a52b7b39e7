// The module-wide tile allocator slot. Tile blocks share ownership of the
// allocator they came from, so that a block is always given back to the place
// it was taken from, even after the slot has moved on.
#include "host/tile_allocator.h"

namespace Vireo {
namespace {
std::shared_ptr<CVirtualAllocator> g_tileAllocator;
}

void InstallTileAllocator(CVirtualAllocator* allocator) {
  g_tileAllocator.reset();
  g_tileAllocator.reset(allocator);
}

CVirtualAllocator* InstalledTileAllocator() {
  return g_tileAllocator.get();
}

std::shared_ptr<CVirtualAllocator> SharedTileAllocator() {
  return g_tileAllocator;
}

}  // namespace Vireo
