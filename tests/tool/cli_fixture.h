// Shared set-up of the tests that run the fringe program: a temporary folder,
// synthetic page files in it, and runs of the program with the module built
// alongside it.
#pragma once

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "program_run.h"
#include "synth_files.h"
#include "temp_folder.h"

namespace FringeTest {

class CliTest : public ::testing::Test {
 protected:
  // Writes a synthetic page under the test folder and returns its path.
  std::string WritePageFile(const std::string& name, Layout layout = Layout::Rgb,
                            double angle = 8.0, bool photo = true, int width = 800,
                            int height = 600) {
    Synth::PageRecipe recipe = PageWithPhoto(width, height, angle, photo);
    recipe.color =
        layout != Layout::Gray && layout != Layout::Gray16 && layout != Layout::GrayAlpha;
    recipe.alpha = layout == Layout::RgbAlpha || layout == Layout::GrayAlpha;
    if (recipe.alpha) recipe.pageAlpha = 200;
    last_ = Synth::GeneratePage(recipe);
    lastRecipe_ = recipe;
    const std::string path = tmp_ / name;
    std::filesystem::create_directories(std::filesystem::path(path).parent_path());
    WritePage(last_, path, layout);
    return path;
  }

  // Runs fringe; "--module" is added after the subcommand.
  RunOutcome Fringe(std::vector<std::string> args) {
    if (!args.empty() && args[0].rfind("-", 0) != 0) {
      args.insert(args.begin() + 1, {"--module", FringeModule()});
    }
    return RunFringe(args);
  }

  // The single JSON line of a one-page run.
  static nlohmann::json OnlyLine(const RunOutcome& r) {
    const auto lines = r.JsonLines();
    EXPECT_EQ(lines.size(), 1u) << r.out << r.err;
    return lines.empty() ? nlohmann::json::object() : lines[0];
  }

  // Largest distance between the reported corners and the true ones.
  static double CornerError(const nlohmann::json& line, const Synth::Page& page) {
    double worst = 0;
    for (int k = 0; k < 4; ++k) {
      const double dx = line["corners"][k][0].get<double>() - page.corners[k][0];
      const double dy = line["corners"][k][1].get<double>() - page.corners[k][1];
      worst = std::max(worst, std::hypot(dx, dy));
    }
    return worst;
  }

  TempFolder tmp_;
  Synth::Page last_;
  Synth::PageRecipe lastRecipe_;
};

}  // namespace FringeTest
