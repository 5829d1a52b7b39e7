// The image-mode channel table.
#include "filter/analysis/channels.h"

namespace Project {

int16_t ChannelCount(uint16_t imageMode, uint16_t fallback) {
  // -1 marks the mode that has no fixed count.
  static constexpr int16_t kChannels[12] = {1, 1, 3, 3, 4, 3, 3, -1, 1, 3, 1, 3};
  if (imageMode >= 12 || kChannels[imageMode] < 0) return static_cast<int16_t>(fallback);
  return kChannels[imageMode];
}

}  // namespace Project
