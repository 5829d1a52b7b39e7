// Blocks from the process heap, for the framework's tile storage when no
// allocator over the host's memory is installed.
#pragma once

#include <cstddef>

namespace Vireo::Platform {

// A block of `bytes` bytes, or null.
void* ProcessHeapAllocate(std::size_t bytes);
// Gives back a block from ProcessHeapAllocate; null is ignored.
void ProcessHeapFree(void* block);

}  // namespace Vireo::Platform
