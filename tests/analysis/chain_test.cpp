// The whole chain on synthetic pages: the published corners and angle land
// near the photo's true corners and angle. A sanity check of the method.
#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

#include "filter/analysis/driver.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::TestFrame;

struct Outcome {
  AnalysisResult result;
  CountingHost host;
  double cornerError = 0.0;  // largest distance to a true corner, pixels
};

Outcome Detect(const Synth::Page& page, int16_t filterCase = 0) {
  TestFrame frame(page);
  if (filterCase != 0) frame.View().filterCase = filterCase;
  Outcome out;
  RunAnalysis(frame.View(), out.host, out.result);
  for (int k = 0; k < 4; ++k) {
    const double dh = out.result.corners.corner[k].h - page.corners[k][0];
    const double dv = out.result.corners.corner[k].v - page.corners[k][1];
    out.cornerError = std::max(out.cornerError, std::hypot(dh, dv));
  }
  return out;
}

Synth::PageRecipe Recipe(int width, int height, bool color, double angle, uint32_t seed) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.color = color;
  recipe.seed = seed;
  // Placed a little off centre, differently for each seed.
  const int shiftX = static_cast<int>(seed * 37 % 11) - 5;
  const int shiftY = static_cast<int>(seed * 53 % 11) - 5;
  const double dx = shiftX * 0.01 * width;
  const double dy = shiftY * 0.01 * height;
  recipe.photo =
      Synth::PhotoRecipe{width * 0.5 + dx, height * 0.5 + dy, width * 0.45, height * 0.42, angle};
  return recipe;
}

void ExpectFound(const Synth::PageRecipe& recipe, double cornerTolerance, double angleTolerance,
                 int16_t filterCase = 0) {
  const Synth::Page page = Synth::GeneratePage(recipe);
  const Outcome out = Detect(page, filterCase);
  const std::string what = std::to_string(recipe.width) + " x " + std::to_string(recipe.height) +
                           (recipe.color ? " RGB" : " gray") + " at " +
                           std::to_string(recipe.photo->angleDegrees);
  ASSERT_EQ(out.host.records.size(), 1U) << what;
  EXPECT_FALSE(out.host.records[0].empty) << what;
  EXPECT_EQ(out.result.confidence, 255) << what;
  EXPECT_LE(out.cornerError, cornerTolerance) << what;
  EXPECT_NEAR(out.result.angle, recipe.photo->angleDegrees, angleTolerance) << what;
}

TEST(ChainTest, PhotosTurnedUpToThirtyDegrees) {
  uint32_t seed = 10;
  for (bool color : {true, false}) {
    for (double angle : {-30.0, -25.0, -20.0, -14.0, -9.5, -4.0, -0.5, 0.0, 0.5, 4.0, 10.0, 15.0,
                         19.5, 25.0, 30.0}) {
      ExpectFound(Recipe(1200, 900, color, angle, ++seed), 5.0, 0.5);
    }
  }
}

TEST(ChainTest, FullSizePagesWithALidShadow) {
  for (double angle : {0.0, 12.0, -27.5}) {
    Synth::PageRecipe recipe = Recipe(2000, 1500, true, angle, 3);
    recipe.lidShadow = true;
    ExpectFound(recipe, 5.0, 0.5);
  }
}

TEST(ChainTest, SmallPagesAtOneToThreeDegreesMayCostAFewPixelsMore) {
  // The half-degree vote over short sides: the method, not a fault.
  for (double angle : {-2.75, -1.5, 1.25, 2.0, 3.0}) {
    ExpectFound(Recipe(800, 600, true, angle, 7), 9.0, 1.5);
  }
  for (double angle : {-21.0, -6.0, 0.0, 8.0, 28.0}) {
    ExpectFound(Recipe(800, 600, false, angle, 8), 5.0, 0.5);
  }
}

TEST(ChainTest, TransparentPageAroundThePhotoInFilterCases4And5) {
  for (int16_t filterCase : {4, 5}) {
    Synth::PageRecipe recipe = Recipe(1200, 900, true, -17.0, 21);
    recipe.alpha = true;
    recipe.pageAlpha = 0;
    ExpectFound(recipe, 5.0, 0.5, filterCase);
  }
}

TEST(ChainTest, BlankPageIsFlat) {
  Synth::PageRecipe recipe = Recipe(1200, 900, true, 0.0, 4);
  recipe.photo.reset();
  const Outcome out = Detect(Synth::GeneratePage(recipe));
  ASSERT_EQ(out.host.records.size(), 1U);
  ASSERT_FALSE(out.host.records[0].empty);
  EXPECT_EQ(out.host.records[0].confidence, 0);
  EXPECT_EQ(out.host.records[0].corners.corner[2].h, 1199);
  EXPECT_EQ(out.host.records[0].corners.corner[2].v, 899);
}

TEST(ChainTest, BlankPageUnderALidShadowFindsNothing) {
  // The shadow makes the top rows dark (touching the top border), but there
  // is no outline to find: the failure record.
  Synth::PageRecipe recipe = Recipe(1200, 900, false, 0.0, 5);
  recipe.photo.reset();
  recipe.lidShadow = true;
  const Outcome out = Detect(Synth::GeneratePage(recipe));
  ASSERT_EQ(out.host.records.size(), 1U);
  EXPECT_TRUE(out.host.records[0].empty);
}

}  // namespace
