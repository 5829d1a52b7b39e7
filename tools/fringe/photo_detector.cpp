// Adapter between the tool and the stand-in host's detection API.
#include "photo_detector.h"

#include <unistd.h>

#include <cmath>
#include <filesystem>

#include "page_error.h"
#include "standin/detect.h"

namespace Fringe {

namespace {

ModuleAnswer AnswerFrom(const Standin::Detection& d) {
  if (!d.error.empty()) throw PageError(ErrorKind::Internal, "module run failed: " + d.error);
  if (!d.recordPresent) {
    throw PageError(ErrorKind::Internal, "the module left no 'fRNG' result record");
  }
  ModuleAnswer a;
  // The record is this run's own answer. The descriptor is written from
  // module-wide state that a failed run leaves as an earlier page set it, so
  // its angle is taken only when the record reports a photo.
  for (int k = 0; k < 4; ++k) a.corners[k] = {d.record[2 * k + 1], d.record[2 * k]};
  a.confidence = d.record[8];
  a.found = a.confidence > 0;
  if (a.found) {
    if (!d.descriptorPresent) {
      throw PageError(ErrorKind::Internal, "the module found a photo but wrote no descriptor");
    }
    a.angle = d.angle;
  }
  return a;
}

Standin::PageView ViewOf(const vips::VImage& image, int channels, bool alpha) {
  Standin::PageView v;
  v.width = image.width();
  v.height = image.height();
  v.channels = channels;
  v.alpha = alpha;
  v.pixels = static_cast<const uint8_t*>(image.data());
  v.rowBytes = static_cast<std::ptrdiff_t>(VIPS_IMAGE_SIZEOF_LINE(image.get_image()));
  return v;
}

// Maps a pixel of the detected copy back onto the page so that the first and
// last pixels of the copy land on the first and last of the page: the module's
// whole-page answer stays the whole page.
int32_t ScaleBack(int32_t v, int32_t copySide, int32_t pageSide) {
  if (copySide <= 1) return v;
  return static_cast<int32_t>(
      std::lround(static_cast<double>(v) * (pageSide - 1) / (copySide - 1)));
}

}  // namespace

PhotoDetector::PhotoDetector(const std::string& modulePath) {
  try {
    module_ = Standin::Module::Load(modulePath);
  } catch (const std::exception& e) {
    throw PageError(ErrorKind::Internal, std::string("cannot load module: ") + e.what());
  }
}

PhotoDetector::~PhotoDetector() = default;

ModuleAnswer PhotoDetector::Detect(const DecodedPage& page, int32_t maxSide) {
  const bool downscale = maxSide > 0 && std::max(page.width, page.height) > maxSide;
  if (!downscale) {
    return AnswerFrom(Standin::Detect(*module_, ViewOf(page.image, page.channels, page.alpha)));
  }
  vips::VImage small;
  try {
    small = DownscaledCopy(page, maxSide);
  } catch (const vips::VError& e) {
    throw PageError(ErrorKind::Internal, std::string("cannot downscale page: ") + e.what());
  }
  ModuleAnswer a = AnswerFrom(Standin::Detect(*module_, ViewOf(small, page.channels, page.alpha)));
  for (Corner& c : a.corners) {
    c = {ScaleBack(c.x, small.width(), page.width), ScaleBack(c.y, small.height(), page.height)};
  }
  a.detectScale = static_cast<double>(small.width()) / page.width;
  return a;
}

ModuleAnswer PhotoDetector::DetectPixels(const Standin::PageView& view,
                                         const std::optional<std::array<int32_t, 4>>& filterRect) {
  Standin::DetectOptions options;
  options.filterRect = filterRect;
  return AnswerFrom(Standin::Detect(*module_, view, options));
}

std::string DefaultModulePath() {
  std::error_code ec;
  const auto self = std::filesystem::read_symlink("/proc/self/exe", ec);
  if (ec) return "Fringe.9zf";
  return (self.parent_path() / "Fringe.9zf").string();
}

}  // namespace Fringe
