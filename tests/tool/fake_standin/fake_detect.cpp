// Temporary fake of the stand-in host: reports the bounding box of the dark
// pixels as an upright photo. Lets the tool be exercised before the real
// module and host are merged; never used by default builds.
#include <algorithm>
#include <filesystem>

#include "standin/detect.h"

namespace Standin {

std::unique_ptr<Module> Module::Load(const std::string& path, bool) {
  if (!std::filesystem::is_regular_file(path)) throw Error(path + ": no such module file");
  return std::unique_ptr<Module>(new Module(path));
}

Detection Detect(Module&, const PageView& page, const DetectOptions&) {
  Detection d;
  if (page.width > 32767 || page.height > 32767) {
    d.error = "page larger than 32767 pixels";
    return d;
  }
  int top = page.height, left = page.width, bottom = -1, right = -1;
  for (int y = 0; y < page.height; ++y) {
    const uint8_t* row = page.pixels + y * page.rowBytes;
    const int step = page.channels + (page.alpha ? 1 : 0);
    for (int x = 0; x < page.width; ++x) {
      if (row[x * step] < 128) {
        top = std::min(top, y), bottom = std::max(bottom, y);
        left = std::min(left, x), right = std::max(right, x);
      }
    }
  }
  d.selectorResults = {0, 0, 0, 0, 0, 0};
  d.recordPresent = true;
  d.descriptorPresent = true;
  const int16_t h = static_cast<int16_t>(page.height), w = static_cast<int16_t>(page.width);
  if (bottom < 0 || page.width < 27 || page.height < 27) {
    d.record = {0,
                0,
                0,
                static_cast<int16_t>(w - 1),
                static_cast<int16_t>(h - 1),
                static_cast<int16_t>(w - 1),
                static_cast<int16_t>(h - 1),
                0,
                0};
  } else {
    d.record = {
        static_cast<int16_t>(top),    static_cast<int16_t>(left),   static_cast<int16_t>(top),
        static_cast<int16_t>(right),  static_cast<int16_t>(bottom), static_cast<int16_t>(right),
        static_cast<int16_t>(bottom), static_cast<int16_t>(left),   255};
  }
  for (int i = 0; i < 8; ++i) d.points[i] = d.record[i];
  d.confidence = d.record[8];
  return d;
}

}  // namespace Standin
