// The module's own activation context (its manifest resource), entered around
// the start-up calls that load system libraries and common controls.
#pragma once

#include <windows.h>

namespace Vireo::Platform {

class ScopedModuleActivation {
 public:
  ScopedModuleActivation();
  ~ScopedModuleActivation();
  ScopedModuleActivation(const ScopedModuleActivation&) = delete;
  ScopedModuleActivation& operator=(const ScopedModuleActivation&) = delete;

 private:
  ULONG_PTR cookie_ = 0;
  bool active_ = false;
};

}  // namespace Vireo::Platform
