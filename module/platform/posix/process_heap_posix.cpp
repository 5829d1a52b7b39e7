// The process heap on POSIX systems: the C library's allocator.
#include <cstdlib>

#include "platform/process_heap.h"

namespace Vireo::Platform {

void* ProcessHeapAllocate(std::size_t bytes) {
  return std::malloc(bytes == 0 ? 1 : bytes);
}

void ProcessHeapFree(void* block) {
  std::free(block);
}

}  // namespace Vireo::Platform
