// Expanding files and folders into pages.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

#include "input_walk.h"
#include "temp_folder.h"

namespace Fringe {
namespace {

namespace fs = std::filesystem;

void Touch(const fs::path& p) {
  fs::create_directories(p.parent_path());
  std::ofstream(p) << "x";
}

std::vector<std::string> Shown(const std::vector<InputEntry>& entries) {
  std::vector<std::string> v;
  for (const InputEntry& e : entries) v.push_back(e.task.display + (e.error.empty() ? "" : " !"));
  return v;
}

TEST(InputWalk, FoldersAreSearchedRecursivelyInNameOrder) {
  FringeTest::TempFolder tmp;
  const fs::path in = tmp.Path() / "in";
  Touch(in / "b.jpg");
  Touch(in / "a.PNG");
  Touch(in / "sub/c.tif");
  Touch(in / "notes.txt");     // not an image name: left alone
  Touch(in / ".hidden.png");   // hidden: left alone
  Touch(in / ".cache/d.png");  // inside a hidden folder: left alone
  const auto entries = ExpandInputs({in.string() + "/"}, "");
  const std::string base = in.string() + "/";
  EXPECT_EQ(Shown(entries),
            (std::vector<std::string>{base + "a.PNG", base + "b.jpg", base + "sub/c.tif"}));
  EXPECT_EQ(entries[2].task.outStem, "sub/c");
  EXPECT_EQ(entries[2].task.path, base + "sub/c.tif");
}

TEST(InputWalk, SymbolicLinkLoopsAreWalkedOnce) {
  FringeTest::TempFolder tmp;
  const fs::path in = tmp.Path() / "in";
  Touch(in / "a/page.png");
  fs::create_directory_symlink("..", in / "a/up");       // back to the top
  fs::create_directory_symlink(in / "a", in / "again");  // a second way into a/
  fs::create_directory_symlink("loop", in / "loop");     // a link to itself
  const auto entries = ExpandInputs({in.string()}, "");
  ASSERT_EQ(entries.size(), 1u) << ::testing::PrintToString(Shown(entries));
  EXPECT_EQ(entries[0].task.display, in.string() + "/a/page.png");
}

TEST(InputWalk, FilesNamedTwiceArePagesOnce) {
  FringeTest::TempFolder tmp;
  Touch(tmp.Path() / "in/page.png");
  const std::string p = tmp / "in/page.png";
  const auto entries = ExpandInputs({p, p, tmp / "in"}, "");
  EXPECT_EQ(entries.size(), 1u);
}

TEST(InputWalk, OutputNamesStayUnique) {
  FringeTest::TempFolder tmp;
  Touch(tmp.Path() / "in/scan.jpg");
  Touch(tmp.Path() / "in/scan.png");
  Touch(tmp.Path() / "other/scan.jpg");
  Touch(tmp.Path() / "third/scan.jpg");
  const auto entries =
      ExpandInputs({tmp / "in", tmp / "other/scan.jpg", tmp / "third/scan.jpg"}, "");
  ASSERT_EQ(entries.size(), 4u);
  EXPECT_EQ(entries[0].task.outStem, "scan");
  EXPECT_EQ(entries[1].task.outStem, "scan.png");  // keeps its extension
  EXPECT_EQ(entries[2].task.outStem, "scan.jpg");
  // Both names taken: an error, not an overwrite.
  EXPECT_FALSE(entries[3].error.empty());
  EXPECT_NE(entries[3].error.find("already taken"), std::string::npos);
}

TEST(InputWalk, TheOutputFolderIsNotReadBack) {
  FringeTest::TempFolder tmp;
  Touch(tmp.Path() / "in/a.png");
  Touch(tmp.Path() / "in/out/a.outline.png");
  const auto entries = ExpandInputs({tmp / "in"}, tmp / "in/out");
  ASSERT_EQ(entries.size(), 1u);
  EXPECT_EQ(entries[0].task.outStem, "a");
}

TEST(InputWalk, MissingAndBrokenNamesAreErrors) {
  FringeTest::TempFolder tmp;
  fs::create_symlink(tmp.Path() / "nowhere.png", tmp.Path() / "dangling.png");
  const auto entries = ExpandInputs({tmp / "missing.png", tmp / "dangling.png"}, "");
  ASSERT_EQ(entries.size(), 2u);
  EXPECT_NE(entries[0].error.find("No such file"), std::string::npos);
  EXPECT_EQ(entries[1].error, "broken symbolic link");
  // A file named on the command line is tried whatever its name.
  Touch(tmp.Path() / "scan.data");
  EXPECT_EQ(ExpandInputs({tmp / "scan.data"}, "").size(), 1u);
}

}  // namespace
}  // namespace Fringe
