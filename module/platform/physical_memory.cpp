// Total physical memory, with the override that tests use to pose as a
// machine of a given size.
#include <atomic>
#include <cerrno>
#include <cstdlib>

#include "platform/platform.h"
#include "platform/system_side.h"

namespace Vireo::Platform {
namespace {

std::atomic<uint64_t> g_override{0};

uint64_t EnvironmentOverride() {
  const char* text = std::getenv("FRINGE_PHYSICAL_MEMORY");
  if (text == nullptr || *text == '\0') return 0;
  char* end = nullptr;
  errno = 0;
  const unsigned long long value = std::strtoull(text, &end, 10);
  if (errno != 0 || end == text || *end != '\0') return 0;
  return value;
}

}  // namespace

void SetPhysicalMemoryOverride(uint64_t bytes) {
  g_override.store(bytes);
}

uint64_t TotalPhysicalMemory() {
  if (const uint64_t forced = g_override.load(); forced != 0) return forced;
  if (const uint64_t fromEnvironment = EnvironmentOverride(); fromEnvironment != 0) {
    return fromEnvironment;
  }
  return Side::QueryPhysicalMemory();
}

}  // namespace Vireo::Platform
