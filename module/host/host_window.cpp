// The host's main window: from the platform data, else from the UIHooks suite.
#include "host/proc_table.h"
#include "host/rastrix_plugin.h"

namespace Vireo {
namespace {
constexpr int kMainWindowProcedure = 11;
using MainWindowProc = void* (*)();
}  // namespace

Platform::WindowHandle CRastrixPlugin::HostMainWindow() {
  if (void* platform = PlatformData()) {
    void* window = nullptr;
    std::memcpy(&window, platform, sizeof window);
    if (window != nullptr) return window;
  }
  const void* hooks = Suite(SuiteId::kUIHooks4);
  if (const auto mainWindow = SuiteProc<MainWindowProc>(hooks, kMainWindowProcedure)) {
    return mainWindow();
  }
  return nullptr;
}

}  // namespace Vireo
