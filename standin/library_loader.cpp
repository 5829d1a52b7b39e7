// dlopen on POSIX systems, LoadLibraryW on Windows.
#include "standin/library_loader.h"

#include <cstring>

#include "standin/error.h"

#ifdef _WIN32
#include <windows.h>
#else
#include <dlfcn.h>
#endif

namespace Standin {

#ifdef _WIN32

namespace {

std::wstring Widen(const std::string& text) {
  if (text.empty()) return {};
  int n = MultiByteToWideChar(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), nullptr, 0);
  std::wstring wide(static_cast<size_t>(n), L'\0');
  MultiByteToWideChar(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), wide.data(), n);
  return wide;
}

std::string SystemMessage(DWORD code) {
  char buffer[512] = {};
  DWORD n = FormatMessageA(FORMAT_MESSAGE_FROM_SYSTEM | FORMAT_MESSAGE_IGNORE_INSERTS, nullptr,
                           code, 0, buffer, sizeof buffer, nullptr);
  std::string text(buffer, n);
  while (!text.empty() && (text.back() == '\n' || text.back() == '\r' || text.back() == ' ')) {
    text.pop_back();
  }
  return text.empty() ? "system error " + std::to_string(code) : text;
}

}  // namespace

std::unique_ptr<LoadedLibrary> LoadedLibrary::Open(const std::string& file,
                                                   const std::string& shownName) {
  // No error boxes from the loader: a failure comes back as a code.
  UINT old = SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
  HMODULE module = LoadLibraryW(Widen(file).c_str());
  DWORD code = GetLastError();
  SetErrorMode(old);
  if (module == nullptr) {
    throw Error("cannot load module '" + shownName + "': " + SystemMessage(code));
  }
  return std::unique_ptr<LoadedLibrary>(new LoadedLibrary(static_cast<void*>(module)));
}

LoadedLibrary::~LoadedLibrary() {
  FreeLibrary(static_cast<HMODULE>(handle_));
}

LoadedLibrary::Function LoadedLibrary::Find(const char* name) const {
  FARPROC address = GetProcAddress(static_cast<HMODULE>(handle_), name);
  Function function = nullptr;
  static_assert(sizeof function == sizeof address);
  std::memcpy(&function, &address, sizeof function);
  return function;
}

#else

std::unique_ptr<LoadedLibrary> LoadedLibrary::Open(const std::string& file,
                                                   const std::string& shownName) {
  // A bare name would make dlopen search the library path; the host loads files.
  std::string local = file.find('/') == std::string::npos ? "./" + file : file;
  void* handle = dlopen(local.c_str(), RTLD_NOW | RTLD_LOCAL);
  if (handle == nullptr) {
    const char* reason = dlerror();
    throw Error("cannot load module '" + shownName + "': " + (reason ? reason : "unknown reason"));
  }
  return std::unique_ptr<LoadedLibrary>(new LoadedLibrary(handle));
}

LoadedLibrary::~LoadedLibrary() {
  dlclose(handle_);
}

LoadedLibrary::Function LoadedLibrary::Find(const char* name) const {
  void* address = dlsym(handle_, name);
  Function function = nullptr;
  static_assert(sizeof function == sizeof address);
  std::memcpy(&function, &address, sizeof function);
  return function;
}

#endif

}  // namespace Standin
