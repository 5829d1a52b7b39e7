// Refinement through the fringe program: the module's answer kept as it was
// published beside the refined outline, outputs following the refined outline
// (the paper or the picture inside its margin), --raw, preparations reported,
// and the same results from worker processes.
#include <gtest/gtest.h>

#include <cmath>
#include <filesystem>
#include <string>
#include <vector>

#include "program_run.h"
#include "synth/hard_pages.h"
#include "synth_files.h"
#include "temp_folder.h"

namespace FringeTest {
namespace {

class RefineCli : public ::testing::Test {
 protected:
  void SetUp() override { EnsureVips(); }

  std::string WriteHardPage(const std::string& name, const Synth::HardPageRecipe& recipe) {
    hard_ = Synth::GenerateHardPage(recipe);
    const std::string path = tmp_ / name;
    WritePage(hard_.page, path, recipe.color ? Layout::Rgb : Layout::Gray);
    return path;
  }

  RunOutcome Fringe(std::vector<std::string> args) {
    args.insert(args.begin() + 1, {"--module", FringeModule()});
    return RunFringe(args);
  }

  static nlohmann::json OnlyLine(const RunOutcome& r) {
    const auto lines = r.JsonLines();
    EXPECT_EQ(lines.size(), 1u) << r.out << r.err;
    return lines.empty() ? nlohmann::json::object() : lines[0];
  }

  // Largest distance of refined corners (pixel centres at whole numbers)
  // from true ones (the generator's, pixel centres at .5).
  static double Error(const nlohmann::json& corners,
                      const std::array<std::array<double, 2>, 4>& truth) {
    double worst = 0.0;
    for (size_t k = 0; k < 4; ++k) {
      worst = std::max(worst, std::hypot(corners[k][0].get<double>() + 0.5 - truth[k][0],
                                         corners[k][1].get<double>() + 0.5 - truth[k][1]));
    }
    return worst;
  }

  static double Side(const std::array<std::array<double, 2>, 4>& q, size_t a, size_t b) {
    return std::hypot(q[b][0] - q[a][0], q[b][1] - q[a][1]);
  }

  TempFolder tmp_;
  Synth::HardPage hard_;
};

TEST_F(RefineCli, JsonKeepsTheModulesAnswerBesideTheRefinedOne) {
  const std::string page = WriteHardPage(
      "border.png", Synth::MakeHardPageRecipe(Synth::HardKind::kWhiteBorder, 2, 1200, 900));
  const nlohmann::json refined = OnlyLine(Fringe({"detect", "--json", page}));
  const nlohmann::json raw = OnlyLine(Fringe({"detect", "--json", "--raw", page}));
  // The module's own fields are the same with and without refinement, the angle to the bit.
  EXPECT_EQ(refined["corners"], raw["corners"]);
  EXPECT_EQ(refined["confidence"], raw["confidence"]);
  EXPECT_EQ(refined["angle"].get<double>(), raw["angle"].get<double>());
  EXPECT_FALSE(raw.contains("refined"));
  ASSERT_TRUE(refined.contains("refined")) << refined.dump();
  const auto& r = refined["refined"];
  EXPECT_EQ(r["status"], "refined");
  EXPECT_TRUE(r["found"].get<bool>());
  EXPECT_LE(Error(r["corners"], hard_.paper), 2.0) << r.dump();
  ASSERT_TRUE(r["margin"].get<bool>());
  EXPECT_LE(Error(r["picture"], hard_.picture), 2.0) << r.dump();
  ASSERT_EQ(r["sides"].size(), 4u);
  for (const auto& side : r["sides"]) {
    EXPECT_TRUE(side.contains("rms") && side.contains("support") && side.contains("contrast"));
    EXPECT_LT(side["rms"].get<double>(), 1.5);
  }
  EXPECT_TRUE(refined["times_ms"].contains("refine"));
  // The module alone missed the paper by about the margin's width.
  EXPECT_GT(Error(raw["corners"], hard_.paper), 10.0);
}

TEST_F(RefineCli, CropFollowsThePaperOrThePictureInsideItsMargin) {
  const auto recipe = Synth::MakeHardPageRecipe(Synth::HardKind::kWhiteBorder, 3, 1200, 900);
  const std::string page = WriteHardPage("border.png", recipe);
  const auto paperLine =
      OnlyLine(Fringe({"crop", "--json", "--format", "png", page, "-o", tmp_ / "paper"}));
  const auto pictureLine = OnlyLine(Fringe(
      {"crop", "--json", "--format", "png", "--edge", "inner", page, "-o", tmp_ / "picture"}));
  const auto rawLine =
      OnlyLine(Fringe({"crop", "--json", "--format", "png", "--raw", page, "-o", tmp_ / "raw"}));
  const vips::VImage paper =
      vips::VImage::new_from_file(paperLine["photo"].get<std::string>().c_str());
  const vips::VImage picture =
      vips::VImage::new_from_file(pictureLine["photo"].get<std::string>().c_str());
  EXPECT_NEAR(paper.width(), (Side(hard_.paper, 0, 1) + Side(hard_.paper, 3, 2)) / 2, 2.0);
  EXPECT_NEAR(paper.height(), (Side(hard_.paper, 0, 3) + Side(hard_.paper, 1, 2)) / 2, 2.0);
  EXPECT_NEAR(picture.width(), (Side(hard_.picture, 0, 1) + Side(hard_.picture, 3, 2)) / 2, 2.0);
  EXPECT_NEAR(picture.height(), (Side(hard_.picture, 0, 3) + Side(hard_.picture, 1, 2)) / 2, 2.0);
  // --raw crops wherever the module put its corners: not the paper.
  const vips::VImage raw = vips::VImage::new_from_file(rawLine["photo"].get<std::string>().c_str());
  EXPECT_GT(std::abs(raw.width() - paper.width()) + std::abs(raw.height() - paper.height()), 10);
  // The paper's crop shows its white margin all round; the picture's does not.
  auto border = [](const vips::VImage& image) {
    const vips::VImage g = image.colourspace(VIPS_INTERPRETATION_B_W);
    const int w = image.width(), h = image.height(), b = 3;
    return (g.crop(0, 0, w, b).avg() + g.crop(0, h - b, w, b).avg() + g.crop(0, 0, b, h).avg() +
            g.crop(w - b, 0, b, h).avg()) /
           4.0;
  };
  EXPECT_GT(border(paper), 225.0);
  EXPECT_LT(border(picture), 200.0);
}

TEST_F(RefineCli, OutlinePictureIsDrawnOnTheRefinedOutline) {
  const std::string page = WriteHardPage(
      "band.png", Synth::MakeHardPageRecipe(Synth::HardKind::kShadowBand, 3, 1000, 750));
  const auto line =
      OnlyLine(Fringe({"draw", "--json", "--outline-format", "png", page, "-o", tmp_ / "out"}));
  const vips::VImage drawn =
      vips::VImage::new_from_file(line["outline"].get<std::string>().c_str());
  const auto& c = line["refined"]["corners"];
  // Halfway along each side the line is red, within a pixel of the refined
  // edge (which runs between pixels); a few pixels outside it is the page.
  for (size_t k = 0; k < 4; ++k) {
    const double x = (c[k][0].get<double>() + c[(k + 1) % 4][0].get<double>()) / 2;
    const double y = (c[k][1].get<double>() + c[(k + 1) % 4][1].get<double>()) / 2;
    int red = 0;
    for (int dy = -1; dy <= 1; ++dy)
      for (int dx = -1; dx <= 1; ++dx)
        if (drawn.getpoint(static_cast<int>(std::lround(x)) + dx,
                           static_cast<int>(std::lround(y)) + dy) == std::vector<double>{255, 0, 0})
          ++red;
    EXPECT_GE(red, 2) << "side " << k;
  }
}

TEST_F(RefineCli, PreparationsAreReported) {
  auto recipe = Synth::MakeHardPageRecipe(Synth::HardKind::kBedStrip, 1, 1200, 900);
  recipe.bedStripSide = 0;
  recipe.bedStripWidth = 30.0;
  const std::string page = WriteHardPage("strip.png", recipe);
  const auto line = OnlyLine(Fringe({"detect", "--json", page}));
  const auto& r = line["refined"];
  ASSERT_EQ(r["preparations"].size(), 1u) << r.dump();
  EXPECT_EQ(r["preparations"][0]["kind"], "bed-strip");
  ASSERT_TRUE(r.contains("prepared"));
  const auto rect = r["prepared"]["filter_rect"];
  EXPECT_GE(rect[0].get<int>(), 30);
  EXPECT_LE(rect[0].get<int>(), 40);
  EXPECT_LE(Error(r["corners"], hard_.paper), 2.0);
  const RunOutcome text = Fringe({"detect", page});
  EXPECT_NE(text.out.find("prepared: dark strip of the scanner bed along the top edge"),
            std::string::npos)
      << text.out;
}

TEST_F(RefineCli, NothingOnThePageOverridesTheModulesFalsePhoto) {
  // A blank page on which the module reports a photo.
  const std::string page = WriteHardPage(
      "blank.png", Synth::MakeHardPageRecipe(Synth::HardKind::kBlank, 7933, 2000, 1500));
  const RunOutcome raw = Fringe({"detect", "--json", "--raw", page});
  if (OnlyLine(raw)["status"] != "found")
    GTEST_SKIP() << "the module reports no photo on this page";
  const RunOutcome refined = Fringe({"detect", "--json", page});
  EXPECT_EQ(refined.exitCode, 1);
  const auto line = OnlyLine(refined);
  EXPECT_EQ(line["status"], "not_found");
  EXPECT_EQ(line["refined"]["status"], "no-photo");
  EXPECT_EQ(line["confidence"], 255);  // the module's own answer stands in its fields
}

TEST_F(RefineCli, WorkersGiveTheSameRefinedResults) {
  std::vector<std::string> pages;
  const Synth::HardKind kinds[] = {Synth::HardKind::kShadowBand, Synth::HardKind::kWhiteBorder,
                                   Synth::HardKind::kBedStrip, Synth::HardKind::kSheared};
  for (const auto kind : kinds) {
    std::string name(Synth::HardKindName(kind));
    name += ".png";
    pages.push_back(WriteHardPage(name, Synth::MakeHardPageRecipe(kind, 4, 900, 700)));
  }
  std::vector<std::string> one{"detect", "--json", "-q", "-j", "1"},
      two{"detect", "--json", "-q", "-j", "2"};
  one.insert(one.end(), pages.begin(), pages.end());
  two.insert(two.end(), pages.begin(), pages.end());
  auto strip = [](std::vector<nlohmann::json> lines) {
    for (auto& l : lines) {
      l.erase("times_ms");
    }
    return lines;
  };
  const auto a = strip(Fringe(one).JsonLines());
  const auto b = strip(Fringe(two).JsonLines());
  ASSERT_EQ(a.size(), pages.size());
  EXPECT_EQ(a, b);
}

}  // namespace
}  // namespace FringeTest
