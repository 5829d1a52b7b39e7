// The platform's dynamic loader, behind one small interface: open a library
// file, look up a symbol, close it again.
#pragma once

#include <memory>
#include <string>

namespace Standin {

class LoadedLibrary {
 public:
  using Function = void (*)();

  // Loads `file`. Throws Standin::Error naming `shownName` (the file the caller
  // knows about) and the loader's reason.
  static std::unique_ptr<LoadedLibrary> Open(const std::string& file, const std::string& shownName);

  ~LoadedLibrary();
  LoadedLibrary(const LoadedLibrary&) = delete;
  LoadedLibrary& operator=(const LoadedLibrary&) = delete;

  // The exported function of that name, or null.
  Function Find(const char* name) const;

 private:
  explicit LoadedLibrary(void* handle) : handle_(handle) {}
  void* handle_ = nullptr;
};

}  // namespace Standin
