// The tool's one link to the module: a loaded module file, driven through the
// stand-in host, turning a decoded page into the module's published answer.
#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "page_loader.h"
#include "page_result.h"

namespace Standin {
class Module;
struct PageView;
}  // namespace Standin

namespace Fringe {

class PhotoDetector {
 public:
  // Throws PageError(Internal) naming the module file when it cannot be loaded.
  explicit PhotoDetector(const std::string& modulePath);
  ~PhotoDetector();
  PhotoDetector(const PhotoDetector&) = delete;
  PhotoDetector& operator=(const PhotoDetector&) = delete;

  // Runs the module on the page (or on a copy no larger than maxSide when the
  // page is larger and maxSide is set); corners come back in page pixels.
  ModuleAnswer Detect(const DecodedPage& page, int32_t maxSide);

  // Runs the module on pixels in memory (a page or a prepared copy of it),
  // within a filter rectangle (top, left, bottom, right) when one is given;
  // corners come back in page pixels.
  ModuleAnswer DetectPixels(const Standin::PageView& view,
                            const std::optional<std::array<int32_t, 4>>& filterRect);

 private:
  std::unique_ptr<Standin::Module> module_;
};

// The module path used when none is given: Fringe.9zf next to the program.
std::string DefaultModulePath();

}  // namespace Fringe
