// The framework's start-up.
#include "host/init_framework.h"

#include "core/main_thread.h"
#include "platform/platform.h"

namespace Vireo {

void InitFramework() {
  if (Platform::IsSystemVersionAtLeast(6, 0, 0)) Platform::MakeProcessDpiAware();
  Platform::InitCommonControls();
  SetMainThreadId(Platform::CurrentThreadId());
}

}  // namespace Vireo
