// Files are written only below the output folder, whole or not at all.
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "output_dir.h"
#include "page_error.h"
#include "program_run.h"
#include "temp_folder.h"

namespace Fringe {
namespace {

namespace fs = std::filesystem;

void WriteText(int fd, const std::string& text) {
  ASSERT_EQ(::write(fd, text.data(), text.size()), static_cast<ssize_t>(text.size()));
}

std::string Slurp(const fs::path& p) {
  return FringeTest::ReadFile(p.string());
}

TEST(OutputDir, RelativePathsThatWouldLeaveAreRefused) {
  for (const char* bad : {"", "/etc/x", "../x", "a/../../x", "a//b", "./a", "a/.", "a/"}) {
    EXPECT_FALSE(IsSafeRelativePath(bad)) << bad;
  }
  for (const char* good : {"a", "a/b/c.png", "..a", "a..b/c", ".hidden"}) {
    EXPECT_TRUE(IsSafeRelativePath(good)) << good;
  }
  FringeTest::TempFolder tmp;
  OutputDir out(tmp / "out");
  try {
    out.Write("../escape.txt", [](int fd) { WriteText(fd, "x"); });
    FAIL() << "no error";
  } catch (const PageError& e) {
    EXPECT_EQ(e.Kind(), ErrorKind::Output);
    EXPECT_NE(std::string(e.what()).find("escape.txt"), std::string::npos);
  }
  EXPECT_FALSE(fs::exists(tmp.Path() / "escape.txt"));
}

TEST(OutputDir, WritesNestedFilesAndCreatesFolders) {
  FringeTest::TempFolder tmp;
  OutputDir out(tmp / "a/b");  // missing parents are created
  const std::string written = out.Write("x/y/z.txt", [](int fd) { WriteText(fd, "hello"); });
  EXPECT_EQ(written, (tmp.Path() / "a/b/x/y/z.txt").string());
  EXPECT_EQ(Slurp(written), "hello");
  // Writing again replaces the file.
  out.Write("x/y/z.txt", [](int fd) { WriteText(fd, "again"); });
  EXPECT_EQ(Slurp(written), "again");
}

TEST(OutputDir, SymbolicLinksInsideTheFolderAreNotFollowed) {
  FringeTest::TempFolder tmp;
  fs::create_directory(tmp.Path() / "elsewhere");
  OutputDir out(tmp / "out");
  // A folder link that leads outside: refused.
  fs::create_directory_symlink(tmp.Path() / "elsewhere", tmp.Path() / "out/sub");
  EXPECT_THROW(out.Write("sub/page.png", [](int fd) { WriteText(fd, "x"); }), PageError);
  EXPECT_TRUE(fs::is_empty(tmp.Path() / "elsewhere"));
  // A file link that leads outside: replaced, its target untouched.
  { std::ofstream(tmp.Path() / "elsewhere/victim") << "keep"; }
  fs::create_symlink(tmp.Path() / "elsewhere/victim", tmp.Path() / "out/photo.png");
  out.Write("photo.png", [](int fd) { WriteText(fd, "new"); });
  EXPECT_EQ(Slurp(tmp.Path() / "elsewhere/victim"), "keep");
  EXPECT_FALSE(fs::is_symlink(tmp.Path() / "out/photo.png"));
  EXPECT_EQ(Slurp(tmp.Path() / "out/photo.png"), "new");
}

TEST(OutputDir, AFailedWriteLeavesNothingBehind) {
  FringeTest::TempFolder tmp;
  OutputDir out(tmp / "out");
  { std::ofstream(tmp.Path() / "out/page.png") << "old"; }
  EXPECT_THROW(out.Write("page.png",
                         [](int fd) {
                           WriteText(fd, "half");
                           throw PageError(ErrorKind::Output, "encoder failed");
                         }),
               PageError);
  // The old file stands and no temporary file is left.
  EXPECT_EQ(Slurp(tmp.Path() / "out/page.png"), "old");
  size_t entries = 0;
  for (const auto& e : fs::directory_iterator(tmp.Path() / "out")) {
    (void)e;
    ++entries;
  }
  EXPECT_EQ(entries, 1u);
}

TEST(OutputDir, AFolderThatCannotBeMadeIsAnOutputError) {
  FringeTest::TempFolder tmp;
  { std::ofstream(tmp.Path() / "file") << "x"; }
  try {
    OutputDir out(tmp / "file/sub");
    FAIL() << "no error";
  } catch (const PageError& e) {
    EXPECT_EQ(e.Kind(), ErrorKind::Output);
    EXPECT_NE(std::string(e.what()).find("file/sub"), std::string::npos);
  }
}

}  // namespace
}  // namespace Fringe
