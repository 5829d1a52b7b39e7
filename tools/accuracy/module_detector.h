// The module's answer through the tool's own road: the real module file,
// loaded once and driven by the stand-in host exactly as the host would.
#pragma once

#include <memory>
#include <string>

#include "refine/detector.h"

namespace Standin {
class Module;
}

namespace Accuracy {

class ModuleDetector : public Refine::Detector {
 public:
  // Throws std::runtime_error naming the file when it cannot be loaded.
  explicit ModuleDetector(const std::string& modulePath);
  ~ModuleDetector() override;
  ModuleDetector(const ModuleDetector&) = delete;
  ModuleDetector& operator=(const ModuleDetector&) = delete;

  Refine::ModuleAnswer Detect(const Refine::PageImage& page,
                              const std::optional<Refine::FilterRect>& rect) override;

 private:
  std::unique_ptr<Standin::Module> module_;
};

// Fringe.9zf next to the running program.
std::string ModuleNextToProgram();

}  // namespace Accuracy
