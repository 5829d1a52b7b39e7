// The handles recorded when the module is attached to the host process.
#include "platform/platform.h"
#include "platform/system_side.h"

namespace Vireo::Platform {
namespace {
ProcessHandles g_handles;
}

const ProcessHandles& GetProcessHandles() {
  return g_handles;
}

void RecordProcessHandles(void* moduleInstance) {
  Side::FillProcessHandles(g_handles, moduleInstance);
}

}  // namespace Vireo::Platform
