// The golden pages.
#include "golden_pages.h"

namespace AnalysisTest {
namespace {

Synth::PageRecipe Recipe(int width, int height, bool color, bool alpha, uint8_t pageAlpha,
                         bool lidShadow, Synth::PhotoRecipe photo, uint32_t seed) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.color = color;
  recipe.alpha = alpha;
  recipe.pageAlpha = pageAlpha;
  recipe.lidShadow = lidShadow;
  recipe.photo = photo;
  recipe.seed = seed;
  return recipe;
}

}  // namespace

std::vector<GoldenPage> GoldenPages() {
  return {
      {"RGB, 11.5 degrees",
       Recipe(600, 450, true, false, 255, false, {310, 215, 270, 190, 11.5}, 101), 1},
      {"gray, lid shadow, -23 degrees",
       Recipe(640, 480, false, false, 255, true, {300, 250, 300, 200, -23.0}, 102), 1},
      {"RGB with transparency, filter case 5, 4.5 degrees",
       Recipe(500, 400, true, true, 60, false, {260, 190, 230, 160, 4.5}, 103), 5},
      {"gray, upright", Recipe(560, 420, false, false, 255, false, {280, 200, 250, 180, 0.0}, 104),
       1},
  };
}

}  // namespace AnalysisTest
