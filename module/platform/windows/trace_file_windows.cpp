// The trace file on Windows: the conventional POSIX folder becomes the user's
// temporary folder; a reparse point planted there is never followed.
#include <windows.h>

#include "platform/platform.h"
#include "platform/windows/wide_text.h"

namespace Vireo::Platform {

std::string TraceFilePath(const std::string& conventionalPath) {
  const size_t slash = conventionalPath.find_last_of("/\\");
  const std::string name =
      slash == std::string::npos ? conventionalPath : conventionalPath.substr(slash + 1);
  wchar_t folder[MAX_PATH + 1] = {};
  const DWORD length = GetTempPathW(MAX_PATH + 1, folder);
  if (length == 0 || length > MAX_PATH) return conventionalPath;
  return Utf8FromWide(std::wstring(folder, length)) + name;
}

bool AppendTraceLine(const std::string& path, const std::string& line, bool replaceExisting) {
  const std::wstring widePath = WideFromUtf8(path);
  if (replaceExisting) DeleteFileW(widePath.c_str());
  HANDLE file =
      CreateFileW(widePath.c_str(), FILE_APPEND_DATA, FILE_SHARE_READ, nullptr, OPEN_ALWAYS,
                  FILE_ATTRIBUTE_NORMAL | FILE_FLAG_OPEN_REPARSE_POINT, nullptr);
  if (file == INVALID_HANDLE_VALUE) return false;
  bool written = false;
  BY_HANDLE_FILE_INFORMATION info{};
  if (GetFileType(file) == FILE_TYPE_DISK && GetFileInformationByHandle(file, &info) != FALSE &&
      (info.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0) {
    DWORD count = 0;
    written =
        WriteFile(file, line.data(), static_cast<DWORD>(line.size()), &count, nullptr) != FALSE &&
        count == line.size();
  }
  CloseHandle(file);
  return written;
}

}  // namespace Vireo::Platform
