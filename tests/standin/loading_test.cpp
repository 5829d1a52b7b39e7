// Loading module files: clear errors naming the file, and private copies that
// share no module-wide state.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "standin/error.h"
#include "standin/module.h"
#include "test_paths.h"

namespace {

namespace fs = std::filesystem;
using Standin::Module;

std::string LoadError(const std::string& path, bool privateCopy = false) {
  try {
    Module::Load(path, privateCopy);
  } catch (const Standin::Error& error) {
    return error.what();
  }
  return "(loaded)";
}

int16_t CallOnce(const Module& module) {
  int16_t result = 0;
  intptr_t data = 0;
  module.Call(2, nullptr, &data, &result);
  return result;
}

TEST(Loading, MissingFileIsNamedWithTheReason) {
  std::string path = TestPath("/nonexistent-folder/Fringe.9zf");
  std::string message = LoadError(path);
  EXPECT_NE(message.find(path), std::string::npos) << message;
  EXPECT_NE(message.find("no such file"), std::string::npos) << message;
}

TEST(Loading, FileThatIsNoLibraryIsRefusedUnderItsOwnName) {
  fs::path file = fs::temp_directory_path() / "fringe-standin-not-a-library.9zf";
  std::ofstream(file) << "not a library\n";
  for (bool privateCopy : {false, true}) {
    std::string message = LoadError(file.string(), privateCopy);
    EXPECT_EQ(message.rfind("cannot load module '" + file.string() + "'", 0), 0u) << message;
  }
  fs::remove(file);
}

TEST(Loading, LibraryWithoutEntryPointIsRefused) {
  std::string path = TestPath(FRINGE_NO_ENTRY_MODULE);
  std::string message = LoadError(path);
  EXPECT_NE(message.find(path), std::string::npos) << message;
  EXPECT_NE(message.find("exports no ENTRYPOINT1"), std::string::npos) << message;
}

TEST(Loading, PrivateCopiesKeepTheirOwnState) {
  std::string path = TestPath(FRINGE_COUNTER_MODULE);
  auto first = Module::Load(path, true);
  auto second = Module::Load(path, true);
  EXPECT_NE(first->LoadedPath(), second->LoadedPath());
  EXPECT_EQ(CallOnce(*first), 1);
  EXPECT_EQ(CallOnce(*first), 2);
  EXPECT_EQ(CallOnce(*second), 1);
}

TEST(Loading, PlainLoadsOfOneFileShareState) {
  std::string path = TestPath(FRINGE_COUNTER_MODULE);
  auto first = Module::Load(path);
  auto second = Module::Load(path);
  int16_t before = CallOnce(*first);
  EXPECT_EQ(CallOnce(*second), before + 1);
}

TEST(Loading, PrivateCopyGoesAwayWithTheModule) {
  auto module = Module::Load(TestPath(FRINGE_COUNTER_MODULE), true);
  fs::path copy = module->LoadedPath();
  ASSERT_TRUE(fs::exists(copy));
  module.reset();
  EXPECT_FALSE(fs::exists(copy));
  EXPECT_FALSE(fs::exists(copy.parent_path()));
}

}  // namespace
