// The host's scratch volumes, read through its property procedures.
#include "host/scratch_volumes.h"

#include <algorithm>
#include <cstring>

#include "host/four_char_code.h"
#include "host/rastrix_plugin.h"

namespace Vireo {
namespace {

constexpr uint32_t kVolumeCountKey = FourCharCode("nusv");
constexpr uint32_t kVolumePathKey = FourCharCode("svlp");

// The NUL-terminated wide text of a locked handle of `bytes` bytes; stops at
// the handle's end when the terminator is missing.
std::wstring WideTextOf(const void* data, int32_t bytes) {
  std::wstring text;
  const auto* cursor = static_cast<const unsigned char*>(data);
  constexpr int32_t kUnit = sizeof(wchar_t);
  for (int32_t offset = 0; offset + kUnit <= bytes; offset += kUnit) {
    wchar_t unit = 0;
    std::memcpy(&unit, cursor + offset, sizeof unit);  // the host may not align it
    if (unit == 0) break;
    text.push_back(unit);
  }
  return text;
}

std::wstring ReadVolumePath(CRastrixPlugin& plugin, HostHandle handle) {
  const int32_t bytes = plugin.GetHostHandleSize(handle);
  if (bytes <= 0) return {};
  const void* data = plugin.LockHostHandle(handle, false);
  std::wstring path;
  if (data != nullptr) path = WideTextOf(data, bytes);
  plugin.UnlockHostHandle(handle);
  return path;
}

}  // namespace

std::vector<std::wstring> ReadScratchVolumes(CRastrixPlugin& plugin) {
  std::vector<std::wstring> volumes;
  intptr_t count = 0;
  if (!plugin.GetHostProperty(kHostPropertySignature, kVolumeCountKey, 0, count)) return volumes;
  count = std::clamp<intptr_t>(count, 0, kMaxScratchVolumes);
  for (int32_t index = 0; index < count; ++index) {
    HostHandle handle = nullptr;
    if (!plugin.GetHostPropertyHandle(kHostPropertySignature, kVolumePathKey, index, handle) ||
        handle == nullptr) {
      continue;
    }
    std::wstring path;
    try {
      path = ReadVolumePath(plugin, handle);
    } catch (...) {
      plugin.DisposeHostHandle(handle);
      throw;
    }
    plugin.DisposeHostHandle(handle);
    if (!path.empty()) volumes.push_back(std::move(path));
  }
  return volumes;
}

}  // namespace Vireo
