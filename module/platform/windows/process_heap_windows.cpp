// The process heap on Windows.
#include <windows.h>

#include "platform/process_heap.h"

namespace Vireo::Platform {

void* ProcessHeapAllocate(std::size_t bytes) {
  return HeapAlloc(GetProcessHeap(), 0, bytes == 0 ? 1 : bytes);
}

void ProcessHeapFree(void* block) {
  if (block != nullptr) HeapFree(GetProcessHeap(), 0, block);
}

}  // namespace Vireo::Platform
