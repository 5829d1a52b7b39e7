// The synthetic page generator: sizes, determinism, geometry, look.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <numbers>
#include <stdexcept>

#include "synth/page_generator.h"

namespace {

using Synth::GeneratePage;
using Synth::Page;
using Synth::PageRecipe;
using Synth::PhotoRecipe;

PageRecipe Small(bool color, bool alpha = false) {
  PageRecipe recipe;
  recipe.width = 240;
  recipe.height = 180;
  recipe.color = color;
  recipe.alpha = alpha;
  recipe.photo = PhotoRecipe{120, 90, 100, 70, 15};
  return recipe;
}

uint8_t At(const Page& page, int x, int y, int k) {
  return page.pixels[(static_cast<size_t>(y) * page.width + x) * page.channels + k];
}

// FNV-1a over the pixels: a fingerprint of the exact bytes.
uint64_t Fingerprint(const Page& page) {
  uint64_t hash = 14695981039346656037ULL;
  for (uint8_t b : page.pixels) {
    hash ^= b;
    hash *= 1099511628211ULL;
  }
  return hash;
}

TEST(PageGeneratorTest, SizeAndChannels) {
  for (bool color : {false, true}) {
    for (bool alpha : {false, true}) {
      const Page page = GeneratePage(Small(color, alpha));
      const int channels = (color ? 3 : 1) + (alpha ? 1 : 0);
      EXPECT_EQ(page.width, 240);
      EXPECT_EQ(page.height, 180);
      EXPECT_EQ(page.channels, channels);
      EXPECT_EQ(page.pixels.size(), static_cast<size_t>(240 * 180 * channels));
    }
  }
}

TEST(PageGeneratorTest, SameRecipeSameBytesOtherSeedOtherBytes) {
  const Page a = GeneratePage(Small(true));
  const Page b = GeneratePage(Small(true));
  EXPECT_EQ(a.pixels, b.pixels);
  PageRecipe other = Small(true);
  other.seed = 2;
  EXPECT_NE(GeneratePage(other).pixels, a.pixels);
}

TEST(PageGeneratorTest, BytesAreTheSameOnEveryPlatform) {
  // Fixed fingerprints: a change here changes every golden analysis result.
  EXPECT_EQ(Fingerprint(GeneratePage(Small(true))), 0x2b45bbb4d4156a63ULL);
  PageRecipe gray = Small(false, true);
  gray.lidShadow = true;
  gray.pageAlpha = 40;
  EXPECT_EQ(Fingerprint(GeneratePage(gray)), 0x76234544492a0d50ULL);
}

TEST(PageGeneratorTest, CornersOfATurnedPhoto) {
  const Page page = GeneratePage(Small(true));
  const auto& c = page.corners;
  const double top = std::hypot(c[1][0] - c[0][0], c[1][1] - c[0][1]);
  const double right = std::hypot(c[2][0] - c[1][0], c[2][1] - c[1][1]);
  EXPECT_NEAR(top, 100.0, 1e-9);
  EXPECT_NEAR(right, 70.0, 1e-9);
  EXPECT_NEAR((c[0][0] + c[2][0]) / 2, 120.0, 1e-9);
  EXPECT_NEAR((c[0][1] + c[2][1]) / 2, 90.0, 1e-9);
  // Counter-clockwise on screen: the top side rises to the right.
  EXPECT_NEAR(std::atan2(-(c[1][1] - c[0][1]), c[1][0] - c[0][0]) * 180.0 / std::numbers::pi, 15.0,
              1e-9);

  const auto upright = Synth::PhotoCorners(PhotoRecipe{50, 40, 20, 10, 0});
  EXPECT_DOUBLE_EQ(upright[0][0], 40.0);
  EXPECT_DOUBLE_EQ(upright[0][1], 35.0);
  EXPECT_DOUBLE_EQ(upright[2][0], 60.0);
  EXPECT_DOUBLE_EQ(upright[2][1], 45.0);
}

TEST(PageGeneratorTest, BlankPageReportsItsOwnCorners) {
  PageRecipe recipe = Small(false);
  recipe.photo.reset();
  const Page page = GeneratePage(recipe);
  EXPECT_EQ(page.corners[2][0], 240.0);
  EXPECT_EQ(page.corners[2][1], 180.0);
  for (size_t i = 0; i < page.pixels.size(); ++i) ASSERT_GE(page.pixels[i], 200) << i;
}

TEST(PageGeneratorTest, PhotoIsDarkPaperLightEdgesAntialiased) {
  PageRecipe recipe = Small(false);
  recipe.photo = PhotoRecipe{120, 90, 100, 70, 0};
  recipe.noise = 0.0;
  const Page page = GeneratePage(recipe);
  EXPECT_LE(At(page, 120, 90, 0), 175);
  EXPECT_GE(At(page, 20, 20, 0), 220);
  // The photo spans x 70 ... 170: pixel 69 is paper, 70 photo. Half a pixel
  // off, the edge pixel mixes both.
  recipe.photo->centerX = 120.5;
  const Page shifted = GeneratePage(recipe);
  const int edge = At(shifted, 70, 90, 0);
  EXPECT_GT(edge, At(shifted, 71, 90, 0) + 20);
  EXPECT_LT(edge, At(shifted, 69, 90, 0) - 20);
}

TEST(PageGeneratorTest, TransparencyPlaneAndLidShadow) {
  PageRecipe recipe = Small(true, true);
  recipe.pageAlpha = 30;
  recipe.lidShadow = true;
  const Page page = GeneratePage(recipe);
  EXPECT_EQ(At(page, 5, 170, 3), 30);
  EXPECT_EQ(At(page, 120, 90, 3), 255);
  PageRecipe plain = recipe;
  plain.lidShadow = false;
  const Page light = GeneratePage(plain);
  EXPECT_LT(At(page, 10, 0, 1) + 40, At(light, 10, 0, 1));
  // The shadow fades with the distance from the top edge.
  EXPECT_LT(At(page, 10, 170, 1), At(light, 10, 170, 1));
  EXPECT_GT(At(page, 10, 170, 1) + 8, At(light, 10, 170, 1));
}

TEST(PageGeneratorTest, BadRecipesAreRefused) {
  PageRecipe zero = Small(true);
  zero.width = 0;
  EXPECT_THROW(GeneratePage(zero), std::invalid_argument);
  PageRecipe huge = Small(true);
  huge.height = 70000;
  EXPECT_THROW(GeneratePage(huge), std::invalid_argument);
  PageRecipe flatPhoto = Small(true);
  flatPhoto.photo->height = 0;
  EXPECT_THROW(GeneratePage(flatPhoto), std::invalid_argument);
  PageRecipe nan = Small(true);
  nan.photo->angleDegrees = std::nan("");
  EXPECT_THROW(GeneratePage(nan), std::invalid_argument);
  PageRecipe noisy = Small(true);
  noisy.noise = -1;
  EXPECT_THROW(GeneratePage(noisy), std::invalid_argument);
}

}  // namespace
