// ProcessorHasAvx2. The compiler's runtime reads the processor's feature
// flags once, and counts AVX2 only where the system enables the wide
// register state, on Windows and POSIX alike; the same query serves both.
#include "platform/cpu/cpu_features.h"

namespace Vireo::Platform {

bool ProcessorHasAvx2() {
#if defined(__x86_64__) && (defined(__GNUC__) || defined(__clang__))
  __builtin_cpu_init();
  return __builtin_cpu_supports("avx2") != 0;
#else
  return false;
#endif
}

}  // namespace Vireo::Platform
