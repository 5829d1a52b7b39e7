// Standin::Detect on a page view; the answer read from the 'fRNG' record and
// the descriptor as the tool reads it.
#include "accuracy/module_detector.h"

#include <filesystem>
#include <stdexcept>

#include "standin/detect.h"

namespace Accuracy {

ModuleDetector::ModuleDetector(const std::string& modulePath)
    : module_(Standin::Module::Load(modulePath)) {}

ModuleDetector::~ModuleDetector() = default;

Refine::ModuleAnswer ModuleDetector::Detect(const Refine::PageImage& page,
                                            const std::optional<Refine::FilterRect>& rect) {
  if (page.pixelBytes != page.channels)
    throw std::runtime_error("the module is given gray or RGB pages only");
  Standin::PageView view;
  view.width = page.width;
  view.height = page.height;
  view.channels = page.channels;
  view.pixels = page.pixels;
  view.rowBytes = page.rowBytes;
  Standin::DetectOptions options;
  options.filterRect = rect;
  const Standin::Detection d = Standin::Detect(*module_, view, options);
  if (!d.error.empty()) throw std::runtime_error("module run failed: " + d.error);
  if (!d.recordPresent) throw std::runtime_error("the module left no result record");
  // The record is this run's own answer; the descriptor's angle belongs to it
  // only when the record reports a photo.
  std::array<int32_t, 8> points{};
  for (size_t k = 0; k < 8; ++k) points[k] = d.record[k];
  const int confidence = d.record[8];
  const double angle = confidence == 255 && d.descriptorPresent ? d.angle : 0.0;
  return Refine::ModuleAnswer::FromPoints(points, angle, confidence);
}

std::string ModuleNextToProgram() {
  std::error_code ec;
  const auto self = std::filesystem::read_symlink("/proc/self/exe", ec);
  if (ec) return "Fringe.9zf";
  return (self.parent_path() / "Fringe.9zf").string();
}

}  // namespace Accuracy
