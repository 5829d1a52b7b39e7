// The command line itself: help, version, usage errors and exit codes.
#include <fstream>

#include "cli_fixture.h"

namespace FringeTest {
namespace {

using UsageTest = CliTest;

TEST_F(UsageTest, HelpAndVersion) {
  const RunOutcome help = RunFringe({"--help"});
  EXPECT_EQ(help.exitCode, 0);
  for (const char* text : {"detect", "draw", "crop", "all", "Exit codes:", "stored pixels",
                           "counter-clockwise", "JSON Lines"}) {
    EXPECT_NE(help.out.find(text), std::string::npos) << text;
  }
  const RunOutcome crop = RunFringe({"crop", "--help"});
  EXPECT_EQ(crop.exitCode, 0);
  EXPECT_NE(crop.out.find("--margin"), std::string::npos);
  const RunOutcome version = RunFringe({"--version"});
  EXPECT_EQ(version.exitCode, 0);
  EXPECT_EQ(version.out.rfind("fringe ", 0), 0u) << version.out;
}

TEST_F(UsageTest, WrongCommandLinesExit64) {
  const std::string page = WritePageFile("page.png");
  const std::vector<std::vector<std::string>> wrong = {
      {},
      {"frobnicate", page},
      {"detect"},
      {"detect", "--bogus", page},
      {"crop", page},  // no output folder
      {"detect", "--max-side", "10", page},
      {"detect", "--max-side", "40000", page},
      {"detect", "-j", "0", page},
      {"crop", "--format", "bmp", page, "-o", tmp_ / "out"},
      {"draw", "--outline-format", "tif", page, "-o", tmp_ / "out"},
      {"all", "--quality", "101", page, "-o", tmp_ / "out"},
  };
  for (const auto& args : wrong) {
    const RunOutcome r = RunFringe(args);
    EXPECT_EQ(r.exitCode, 64) << ::testing::PrintToString(args) << r.err;
    EXPECT_FALSE(r.err.empty());
    EXPECT_TRUE(r.out.empty());
  }
  EXPECT_FALSE(std::filesystem::exists(tmp_ / "out"));
}

TEST_F(UsageTest, ExitCodesFollowThePages) {
  const std::string found = WritePageFile("found.png");
  const std::string blank = WritePageFile("blank.png", Layout::Rgb, 0.0, false);
  EXPECT_EQ(Fringe({"detect", found}).exitCode, 0);
  EXPECT_EQ(Fringe({"detect", blank}).exitCode, 1);
  EXPECT_EQ(Fringe({"detect", found, blank}).exitCode, 1);
  std::ofstream(tmp_ / "bad.png") << "x";
  EXPECT_EQ(Fringe({"detect", found, blank, tmp_ / "bad.png"}).exitCode, 2);
}

TEST_F(UsageTest, AModuleThatCannotBeLoadedIsAnInternalFailure) {
  const std::string page = WritePageFile("page.png");
  const std::string missing = tmp_ / "nowhere/Fringe.9zf";
  const RunOutcome r = RunFringe({"detect", "--module", missing, page});
  EXPECT_EQ(r.exitCode, 70);
  EXPECT_NE(r.err.find(missing), std::string::npos) << r.err;
  // Not a module at all.
  const RunOutcome notModule = RunFringe({"detect", "--module", page, page});
  EXPECT_EQ(notModule.exitCode, 70);
  EXPECT_NE(notModule.err.find("cannot load module"), std::string::npos) << notModule.err;
}

TEST_F(UsageTest, TheModuleIsFoundNextToTheProgram) {
  const std::string page = WritePageFile("page.png");
  const RunOutcome r = RunFringe({"detect", "--json", page});
  EXPECT_EQ(r.exitCode, 0) << r.err;
  EXPECT_EQ(OnlyLine(r)["status"], "found");
}

TEST_F(UsageTest, TextOutputNamesCornersAngleAndConfidence) {
  const std::string page = WritePageFile("page.png", Layout::Rgb, 5.0);
  // The module's own answer; the refined line is tested with the refinement.
  const RunOutcome r = Fringe({"detect", "--raw", page});
  ASSERT_EQ(r.exitCode, 0) << r.err;
  const nlohmann::json j = OnlyLine(Fringe({"detect", "--raw", "--json", page}));
  std::string expected = page + ": photo at";
  for (int k = 0; k < 4; ++k) {
    expected += " (" + std::to_string(j["corners"][k][0].get<int>()) + "," +
                std::to_string(j["corners"][k][1].get<int>()) + ")";
  }
  EXPECT_EQ(r.out.rfind(expected, 0), 0u) << r.out;
  EXPECT_NE(r.out.find("confidence 255"), std::string::npos);
  // One page: no progress or summary.
  EXPECT_TRUE(r.err.empty()) << r.err;
}

}  // namespace
}  // namespace FringeTest
