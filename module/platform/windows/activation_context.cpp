// Entering the module's activation context. The context is created once from
// the module's manifest and kept for the life of the process; a module
// without a manifest, or a test program that has no module handle, simply
// runs in the process's default context.
#include "platform/windows/activation_context.h"

#include "platform/platform.h"

namespace Vireo::Platform {
namespace {

constexpr WORD kManifestResource = 2;

HANDLE ModuleActivationContext() {
  static const HANDLE context = [] {
    auto* module = static_cast<HMODULE>(GetProcessHandles().moduleInstance);
    if (module == nullptr) return INVALID_HANDLE_VALUE;
    ACTCTXW request{};
    request.cbSize = sizeof request;
    request.dwFlags = ACTCTX_FLAG_HMODULE_VALID | ACTCTX_FLAG_RESOURCE_NAME_VALID;
    request.hModule = module;
    request.lpResourceName = MAKEINTRESOURCEW(kManifestResource);
    return CreateActCtxW(&request);
  }();
  return context;
}

}  // namespace

ScopedModuleActivation::ScopedModuleActivation() {
  const HANDLE context = ModuleActivationContext();
  if (context != INVALID_HANDLE_VALUE) active_ = ActivateActCtx(context, &cookie_) != FALSE;
}

ScopedModuleActivation::~ScopedModuleActivation() {
  if (active_) DeactivateActCtx(0, cookie_);
}

}  // namespace Vireo::Platform
