// Vireo::CVirtualHeap: tile storage within a budget.
#include "host/virtual_heap.h"

#include <iterator>
#include <stdexcept>

#include "core/error.h"
#include "core/system_error.h"
#include "platform/process_heap.h"

namespace Vireo {
namespace {

constexpr std::uint32_t kOutOfMemory = 14;  // the system's out-of-memory number

}  // namespace

CVirtualHeap::~CVirtualHeap() {
  for (auto& [memory, block] : inUse_) GiveBack(block);
  for (Block& block : spare_) GiveBack(block);
}

void* CVirtualHeap::AcquireTile(int sizeClass) {
  if (sizeClass < 0 || sizeClass > kMaxSizeClass) {
    throw std::out_of_range("tile size class " + std::to_string(sizeClass));
  }
  const std::uint32_t size = 256U << sizeClass;
  const std::shared_ptr<CVirtualAllocator> source = SharedTileAllocator();
  // The latest spare of this size from the place tiles now come from serves first.
  for (auto spare = spare_.rbegin(); spare != spare_.rend(); ++spare) {
    if (spare->size == size && spare->source == source) {
      void* memory = spare->memory;
      inUse_.emplace(memory, *spare);
      spare_.erase(std::next(spare).base());
      return memory;
    }
  }
  if (heldBytes_ + size > budget_) TrimSpares(budget_ > size ? budget_ - size : 0);
  if (heldBytes_ + size > budget_) {
    throw CError::WithReason(
        "$$$/Vireo/VirtualHeap/AcquireTileError=No more virtual tiles can be allocated.");
  }
  Block block = TakeBlock(size);
  try {
    inUse_.emplace(block.memory, block);
  } catch (...) {
    GiveBack(block);  // not recorded: nobody else could give it back
    throw;
  }
  heldBytes_ += size;
  return block.memory;
}

void CVirtualHeap::ReleaseTile(void* tile) {
  if (tile == nullptr) return;
  const auto found = inUse_.find(tile);
  if (found == inUse_.end()) throw std::invalid_argument("not a tile of this heap");
  Block block = std::move(found->second);
  inUse_.erase(found);
  if (block.source == SharedTileAllocator() && heldBytes_ <= budget_) {
    spare_.push_back(std::move(block));
    return;
  }
  heldBytes_ -= block.size;
  GiveBack(block);
}

void CVirtualHeap::SetTileBudget(std::uint64_t bytes) {
  budget_ = bytes;
  TrimSpares(budget_);
}

void CVirtualHeap::SetUpBackingStorage(std::vector<std::wstring> volumes) {
  volumes_ = std::move(volumes);
  hasBackingStorage_ = true;
}

CVirtualHeap::Block CVirtualHeap::TakeBlock(std::uint32_t size) {
  Block block;
  block.size = size;
  block.source = SharedTileAllocator();
  // No fallback: a failing allocator does not send tiles to the process heap.
  block.memory = block.source ? block.source->Allocate(size) : Platform::ProcessHeapAllocate(size);
  if (block.memory == nullptr) throw CSystemError(kOutOfMemory);
  return block;
}

void CVirtualHeap::GiveBack(Block& block) {
  if (block.source) {
    block.source->Free(block.memory);
  } else {
    Platform::ProcessHeapFree(block.memory);
  }
  block.memory = nullptr;
}

void CVirtualHeap::TrimSpares(std::uint64_t limit) {
  while (heldBytes_ > limit && !spare_.empty()) {
    Block block = std::move(spare_.back());
    spare_.pop_back();
    heldBytes_ -= block.size;
    GiveBack(block);
  }
}

}  // namespace Vireo
