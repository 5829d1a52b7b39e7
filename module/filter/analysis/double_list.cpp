// AllocList and FreeList.
#include "filter/analysis/double_list.h"

#include <cstddef>

#include "filter/analysis/allocation.h"

namespace Project {

bool AllocList(DoubleList& list, int32_t count) {
  list.count = count;
  list.data.reset();
  if (count <= 0) return false;
  list.data = AllocateZeroed<double>(static_cast<std::size_t>(count));
  return list.data != nullptr;
}

bool FreeList(DoubleList& list) {
  list.count = 0;
  if (!list.data) return false;
  list.data.reset();
  return true;
}

}  // namespace Project
