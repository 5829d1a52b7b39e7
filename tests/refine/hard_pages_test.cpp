// The hard page set: deterministic pages whose truth is the paper's outline.
#include "synth/hard_pages.h"

#include <gtest/gtest.h>

#include <cmath>
#include <stdexcept>

namespace Synth {
namespace {

double Gray(const Page& page, double x, double y) {
  const int ix = static_cast<int>(std::floor(x));
  const int iy = static_cast<int>(std::floor(y));
  const uint8_t* p =
      page.pixels.data() +
      (static_cast<size_t>(iy) * static_cast<size_t>(page.width) + static_cast<size_t>(ix)) *
          static_cast<size_t>(page.channels);
  double sum = 0.0;
  for (int c = 0; c < page.channels; ++c) sum += p[c];
  return sum / page.channels;
}

// A point at `along` of the way down side k, `out` px outward (negative: inward).
std::array<double, 2> AcrossSide(const std::array<std::array<double, 2>, 4>& q, int k, double along,
                                 double out) {
  const auto& a = q[static_cast<size_t>(k)];
  const auto& b = q[static_cast<size_t>((k + 1) % 4)];
  const double dx = b[0] - a[0], dy = b[1] - a[1];
  const double len = std::hypot(dx, dy);
  return {a[0] + dx * along + dy / len * out, a[1] + dy * along - dx / len * out};
}

TEST(HardPages, SameRecipeSamePage) {
  const HardPageRecipe recipe = MakeHardPageRecipe(HardKind::kShadowBand, 5, 800, 600);
  const HardPage a = GenerateHardPage(recipe);
  const HardPage b = GenerateHardPage(recipe);
  EXPECT_EQ(a.page.pixels, b.page.pixels);
  EXPECT_EQ(a.paper, b.paper);
  const HardPage c = GenerateHardPage(MakeHardPageRecipe(HardKind::kShadowBand, 6, 800, 600));
  EXPECT_NE(a.page.pixels, c.page.pixels);
}

TEST(HardPages, TruthIsThePapersOutline) {
  HardPageRecipe recipe = MakeHardPageRecipe(HardKind::kPlain, 3, 900, 700);
  recipe.noise = 0.0;
  const HardPage hard = GenerateHardPage(recipe);
  ASSERT_TRUE(hard.hasPhoto);
  for (int k = 0; k < 4; ++k) {
    for (double along : {0.25, 0.5, 0.75}) {
      const auto inside = AcrossSide(hard.paper, k, along, -3.0);
      const auto outside = AcrossSide(hard.paper, k, along, 3.0);
      // The picture never reaches the lid's brightness; the lid is all round it.
      EXPECT_LT(Gray(hard.page, inside[0], inside[1]), recipe.lidLevel - 15.0) << "side " << k;
      EXPECT_NEAR(Gray(hard.page, outside[0], outside[1]), recipe.lidLevel, 6.0) << "side " << k;
    }
  }
}

TEST(HardPages, WhiteMarginLiesBetweenPaperAndPicture) {
  HardPageRecipe recipe = MakeHardPageRecipe(HardKind::kWhiteBorder, 2, 1000, 800);
  recipe.noise = 0.0;
  recipe.shadows = {};
  const HardPage hard = GenerateHardPage(recipe);
  for (int k = 0; k < 4; ++k) {
    // The picture's corner is the border's width in from the paper's along both sides.
    const double d =
        std::hypot(hard.picture[static_cast<size_t>(k)][0] - hard.paper[static_cast<size_t>(k)][0],
                   hard.picture[static_cast<size_t>(k)][1] - hard.paper[static_cast<size_t>(k)][1]);
    EXPECT_NEAR(d, recipe.border * std::sqrt(2.0), 1e-6);
    const auto margin = AcrossSide(hard.paper, k, 0.5, -0.5 * recipe.border);
    EXPECT_NEAR(Gray(hard.page, margin[0], margin[1]), recipe.paperWhite, 6.0);
  }
}

TEST(HardPages, ShearTurnsTheLeftAndRightSidesOnly) {
  HardPageRecipe recipe = MakeHardPageRecipe(HardKind::kSheared, 1, 1000, 800);
  recipe.angleDegrees = 0.0;
  recipe.shearDegrees = 0.15;
  const HardPage hard = GenerateHardPage(recipe);
  const auto& q = hard.paper;
  EXPECT_NEAR(q[0][1], q[1][1], 1e-9);  // top stays level
  const double leftTurn =
      std::atan2(q[0][0] - q[3][0], q[3][1] - q[0][1]) * 180.0 / 3.14159265358979;
  EXPECT_NEAR(std::abs(leftTurn), 0.15, 1e-6);
}

TEST(HardPages, OffPageTruthStopsAtThePageEdge) {
  for (uint32_t seed = 1; seed <= 4; ++seed) {
    const HardPage hard = GenerateHardPage(MakeHardPageRecipe(HardKind::kOffPage, seed, 1000, 800));
    int onEdge = 0;
    for (const auto& c : hard.paper) {
      EXPECT_GE(c[0], 0.0);
      EXPECT_LE(c[0], 1000.0);
      EXPECT_GE(c[1], 0.0);
      EXPECT_LE(c[1], 800.0);
      if (c[0] == 0.0 || c[0] == 1000.0 || c[1] == 0.0 || c[1] == 800.0) ++onEdge;
    }
    EXPECT_EQ(onEdge, 2) << "seed " << seed;
  }
}

TEST(HardPages, BlankPagesHaveNoPhoto) {
  const HardPage hard = GenerateHardPage(MakeHardPageRecipe(HardKind::kBlank, 1, 640, 480));
  EXPECT_FALSE(hard.hasPhoto);
  EXPECT_EQ(hard.page.corners[2][0], 640.0);
}

TEST(HardPages, SetCyclesThroughEveryKind) {
  const auto recipes = HardPageSet(30, 1);
  ASSERT_EQ(recipes.size(), 30u);
  for (int i = 0; i < 30; ++i)
    EXPECT_EQ(static_cast<int>(recipes[static_cast<size_t>(i)].kind), i % 15);
  for (int k = 0; k < static_cast<int>(HardKind::kCount); ++k) {
    const auto kind = static_cast<HardKind>(k);
    EXPECT_EQ(HardKindFromName(HardKindName(kind)), kind);
  }
  EXPECT_FALSE(HardKindFromName("nonsense"));
}

TEST(HardPages, RefusesRecipesItCannotDraw) {
  HardPageRecipe recipe = MakeHardPageRecipe(HardKind::kPlain, 1, 800, 600);
  HardPageRecipe bad = recipe;
  bad.width = 10;
  EXPECT_THROW(GenerateHardPage(bad), std::invalid_argument);
  bad = recipe;
  bad.angleDegrees = std::nan("");
  EXPECT_THROW(GenerateHardPage(bad), std::invalid_argument);
  bad = recipe;
  bad.border = recipe.paperWidth;
  EXPECT_THROW(GenerateHardPage(bad), std::invalid_argument);
  bad = recipe;
  bad.centerX = -5000.0;  // nothing of the paper left on the page
  EXPECT_THROW(GenerateHardPage(bad), std::invalid_argument);
}

}  // namespace
}  // namespace Synth
