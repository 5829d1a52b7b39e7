// The running program's folder: from the system on Windows (argv[0] may be
// anything there), from argv[0] elsewhere.
#include "program_folder.h"

#include <filesystem>

#ifdef _WIN32
#include <windows.h>
#endif

namespace Runner {

std::string ProgramFolder(const char* argv0) {
#ifdef _WIN32
  (void)argv0;
  wchar_t buffer[MAX_PATH * 4] = {};
  DWORD n = GetModuleFileNameW(nullptr, buffer, static_cast<DWORD>(std::size(buffer)));
  if (n > 0 && n < std::size(buffer)) {
    return std::filesystem::path(buffer).parent_path().string();
  }
  return ".";
#else
  std::filesystem::path path(argv0 != nullptr ? argv0 : "");
  return path.has_parent_path() ? path.parent_path().string() : ".";
#endif
}

}  // namespace Runner
