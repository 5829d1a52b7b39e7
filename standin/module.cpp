// Loading a module file, optionally as a private copy in a temporary folder.
#include "standin/module.h"

#include <atomic>
#include <chrono>
#include <filesystem>
#include <random>
#include <system_error>

#include "standin/error.h"
#include "standin/library_loader.h"

namespace Standin {

namespace fs = std::filesystem;

namespace {

// A fresh folder under the system's temporary folder, created here so that no
// other process can have planted anything inside it.
fs::path MakeUniqueFolder() {
  static std::atomic<unsigned> counter{0};
  std::random_device entropy;
  std::error_code error;
  fs::path base = fs::temp_directory_path(error);
  if (error) throw Error("cannot find the temporary folder: " + error.message());
  for (int attempt = 0; attempt < 100; ++attempt) {
    auto tick = std::chrono::steady_clock::now().time_since_epoch().count();
    std::string name = "fringe-module-" + std::to_string(entropy()) + "-" +
                       std::to_string(counter++) + "-" + std::to_string(tick & 0xFFFFFF);
    fs::path folder = base / name;
    if (fs::create_directory(folder, error)) return folder;
  }
  throw Error("cannot create a private folder under '" + base.string() + "'");
}

}  // namespace

std::unique_ptr<Module> Module::Load(const std::string& path, bool privateCopy) {
  std::error_code error;
  if (!fs::is_regular_file(path, error)) {
    throw Error("cannot load module '" + path +
                "': " + (fs::exists(path, error) ? "not a regular file" : "no such file"));
  }
  std::string loadedPath = path;
  std::string copyFolder;
  if (privateCopy) {
    fs::path folder = MakeUniqueFolder();
    fs::path source(path);
    // A distinct file name as well: some loaders match modules by their base name.
    fs::path copy = folder / (source.stem().string() + "-" + folder.filename().string() +
                              source.extension().string());
    if (!fs::copy_file(source, copy, error)) {
      fs::remove_all(folder, error);
      throw Error("cannot load module '" + path + "': copying it failed: " + error.message());
    }
    loadedPath = copy.string();
    copyFolder = folder.string();
  }
  std::unique_ptr<LoadedLibrary> library;
  try {
    library = LoadedLibrary::Open(loadedPath, path);
  } catch (const Error&) {
    if (!copyFolder.empty()) fs::remove_all(copyFolder, error);
    throw;
  }
  LoadedLibrary::Function function = library->Find("ENTRYPOINT1");
  if (function == nullptr) {
    library.reset();
    if (!copyFolder.empty()) fs::remove_all(copyFolder, error);
    throw Error("cannot use module '" + path + "': it exports no ENTRYPOINT1");
  }
  // The loader hands out a generic function address; ENTRYPOINT1 has this signature.
  EntryPoint entry = reinterpret_cast<EntryPoint>(function);
  return std::unique_ptr<Module>(
      new Module(path, loadedPath, copyFolder, std::move(library), entry));
}

std::unique_ptr<Module> Module::Wrap(EntryPoint entry, std::string name) {
  std::string loaded = name;
  return std::unique_ptr<Module>(
      new Module(std::move(name), std::move(loaded), {}, nullptr, entry));
}

Module::Module(std::string path, std::string loadedPath, std::string copyFolder,
               std::unique_ptr<LoadedLibrary> library, EntryPoint entry)
    : path_(std::move(path)),
      loadedPath_(std::move(loadedPath)),
      copyFolder_(std::move(copyFolder)),
      library_(std::move(library)),
      entry_(entry) {}

Module::~Module() {
  library_.reset();  // unload before the file goes: Windows keeps a loaded file locked
  if (!copyFolder_.empty()) {
    std::error_code error;
    fs::remove_all(copyFolder_, error);
  }
}

void Module::Call(int16_t selector, void* record, intptr_t* data, int16_t* result) const {
  entry_(selector, record, data, result);
}

}  // namespace Standin
