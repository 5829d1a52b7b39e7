// Vireo::CBufferSuiteAllocator: tile blocks from the host's buffer suite.
#include "host/buffer_suite_allocator.h"

namespace Vireo {

void* CBufferSuiteAllocator::Allocate(std::uint32_t size) {
  const auto newBuffer = SuiteProc<BufferSuiteNewProc>(suite_, kBufferSuiteNewPosition);
  if (newBuffer == nullptr) return nullptr;
  std::uint32_t requested = size;
  void* block = newBuffer(&requested, size);
  if (block != nullptr && requested < size) {
    // Smaller than asked for: a tile written to it would overrun the host's buffer.
    Free(block);
    return nullptr;
  }
  return block;
}

void CBufferSuiteAllocator::Free(void* block) {
  const auto dispose = SuiteProc<BufferSuiteDisposeProc>(suite_, kBufferSuiteDisposePosition);
  if (block == nullptr || dispose == nullptr) return;
  dispose(&block);
}

}  // namespace Vireo
