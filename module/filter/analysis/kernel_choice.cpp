// The kernel build switch: the processor's answer, asked once, and the
// tests' override.
#include "filter/analysis/kernel_choice.h"

#include "platform/cpu/cpu_features.h"

namespace Project {
namespace {
bool portableForced = false;
}  // namespace

bool UseWideKernels() {
  static const bool wide = FRINGE_WIDE_KERNELS != 0 && Vireo::Platform::ProcessorHasAvx2();
  return wide && !portableForced;
}

void ForcePortableKernels(bool force) {
  portableForced = force;
}

}  // namespace Project
