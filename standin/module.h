// A loaded module file and its one entry point. Loading a private copy gives a
// module with no module-wide state shared with any other load of the same file.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

namespace Standin {

class LoadedLibrary;

// The signature of ENTRYPOINT1: selector, record, data slot, result word.
using EntryPoint = void (*)(int16_t selector, void* record, intptr_t* data, int16_t* result);

class Module {
 public:
  // Loads the module file at `path`. With `privateCopy`, the file is first copied
  // under a unique name into a fresh temporary folder and that copy is loaded; the
  // copy is removed again when the Module is destroyed. Throws Standin::Error
  // naming the file and the reason when the file cannot be loaded or has no
  // ENTRYPOINT1.
  static std::unique_ptr<Module> Load(const std::string& path, bool privateCopy = false);

  // An entry point linked into this program instead of a module file, so that
  // the host itself can be tested against a module written for the test.
  static std::unique_ptr<Module> Wrap(EntryPoint entry, std::string name);

  ~Module();
  Module(const Module&) = delete;
  Module& operator=(const Module&) = delete;

  // The path given to Load.
  const std::string& Path() const { return path_; }
  // The file actually loaded (the copy when loaded privately).
  const std::string& LoadedPath() const { return loadedPath_; }

  // Calls ENTRYPOINT1 once.
  void Call(int16_t selector, void* record, intptr_t* data, int16_t* result) const;

 private:
  Module(std::string path, std::string loadedPath, std::string copyFolder,
         std::unique_ptr<LoadedLibrary> library, EntryPoint entry);

  std::string path_;
  std::string loadedPath_;
  std::string copyFolder_;  // empty unless a private copy was made
  std::unique_ptr<LoadedLibrary> library_;
  EntryPoint entry_ = nullptr;
};

}  // namespace Standin
