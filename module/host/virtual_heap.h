// Vireo::CVirtualHeap: the framework's tile storage behind the windowing
// toolkit's pixmaps, kept to the least that honours its budget and the
// allocator interface. Tiles of 256 << n bytes come from the installed tile
// allocator when there is one, otherwise from the process heap, and go back to
// the same place. Given-back tiles are kept for reuse while the budget allows.
// The heap does not page: once the budget is spent, a further tile is refused.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/tile_allocator.h"

namespace Vireo {

class CVirtualHeap {
 public:
  // Largest size class: tiles of 256 << 16 bytes (16 MiB).
  static constexpr int kMaxSizeClass = 16;

  CVirtualHeap() = default;
  CVirtualHeap(const CVirtualHeap&) = delete;
  CVirtualHeap& operator=(const CVirtualHeap&) = delete;
  // Gives every block back to where it came from.
  ~CVirtualHeap();

  // A tile of 256 << sizeClass bytes. Raises CSystemError 14 when its source
  // gives no memory, CError (no more virtual tiles) when the budget is spent,
  // std::out_of_range for a size class outside 0..kMaxSizeClass.
  void* AcquireTile(int sizeClass);
  // Gives a tile back; null is ignored, a pointer the heap did not hand out is
  // refused with std::invalid_argument.
  void ReleaseTile(void* tile);

  // Keeps the budget; spare tiles beyond it are given back at once.
  void SetTileBudget(std::uint64_t bytes);
  std::uint64_t TileBudget() const { return budget_; }
  // Bytes held in tiles, handed out or spare.
  std::uint64_t HeldBytes() const { return heldBytes_; }
  std::size_t TilesInUse() const { return inUse_.size(); }
  std::size_t SpareTiles() const { return spare_.size(); }

  bool HasBackingStorage() const { return hasBackingStorage_; }
  // Takes the scratch volumes (paths; possibly none) as backing storage.
  void SetUpBackingStorage(std::vector<std::wstring> volumes);
  const std::vector<std::wstring>& ScratchVolumes() const { return volumes_; }

 private:
  struct Block {
    void* memory = nullptr;
    std::uint32_t size = 0;
    std::shared_ptr<CVirtualAllocator> source;  // null: the process heap
  };

  Block TakeBlock(std::uint32_t size);
  void GiveBack(Block& block);
  void TrimSpares(std::uint64_t limit);

  std::uint64_t budget_ = 0;
  std::uint64_t heldBytes_ = 0;
  std::unordered_map<void*, Block> inUse_;
  std::vector<Block> spare_;
  bool hasBackingStorage_ = false;
  std::vector<std::wstring> volumes_;
};

}  // namespace Vireo
