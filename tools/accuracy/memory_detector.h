// The module's analysis run in memory on a copy of the page, as the filter
// runs it on the host's buffers: the same answer, without loading the module.
#pragma once

#include "refine/detector.h"

namespace Accuracy {

class MemoryDetector : public Refine::Detector {
 public:
  Refine::ModuleAnswer Detect(const Refine::PageImage& page,
                              const std::optional<Refine::FilterRect>& rect) override;
};

}  // namespace Accuracy
