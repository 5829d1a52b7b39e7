// Vireo::CBufferSuiteAllocator: tile blocks taken from the host's buffer suite,
// so that the framework's heap shares the host's memory instead of competing.
#pragma once

#include "host/buffer_suite.h"
#include "host/tile_allocator.h"

namespace Vireo {

class CBufferSuiteAllocator final : public CVirtualAllocator {
 public:
  explicit CBufferSuiteAllocator(const void* suite) : suite_(suite) {}

  void* Allocate(std::uint32_t size) override;
  void Free(void* block) override;

 private:
  const void* suite_;
};

}  // namespace Vireo
