// Where the module's answer comes from: the real module through the stand-in
// host in the tool, or the same analysis run in memory during development.
// Refinement and page preparation only ever see this interface.
#pragma once

#include <array>
#include <cstdint>
#include <optional>

#include "refine/page_image.h"
#include "refine/refine.h"

namespace Refine {

// top, left, bottom, right in page pixels; bottom and right one past the end.
using FilterRect = std::array<int32_t, 4>;

class Detector {
 public:
  virtual ~Detector() = default;
  // The module's published answer for the page, corners in page coordinates,
  // run on the given filter rectangle (the whole page when unset). Throws
  // std::runtime_error when the run itself fails.
  virtual ModuleAnswer Detect(const PageImage& page, const std::optional<FilterRect>& rect) = 0;
};

}  // namespace Refine
