// The filter's memory claim.
#include "filter/memory_claim.h"

#include <algorithm>
#include <limits>

namespace Project {

int32_t MemoryClaim(int32_t planes, int32_t width, int32_t height) {
  const int64_t p = planes;
  const int64_t w = width;
  const int64_t h = height;
  const int64_t claim = w + h + 2 * ((p * h + 1) * w + w + 2 * h);
  return static_cast<int32_t>(std::clamp<int64_t>(claim, 0, std::numeric_limits<int32_t>::max()));
}

}  // namespace Project
