// The golden pages.
#include "golden_pages.h"

namespace AnalysisTest {
namespace {

Synth::PageSpec Spec(int width, int height, bool color, bool alpha, uint8_t pageAlpha,
                     bool lidShadow, Synth::PhotoSpec photo, uint32_t seed) {
  Synth::PageSpec spec;
  spec.width = width;
  spec.height = height;
  spec.color = color;
  spec.alpha = alpha;
  spec.pageAlpha = pageAlpha;
  spec.lidShadow = lidShadow;
  spec.photo = photo;
  spec.seed = seed;
  return spec;
}

}  // namespace

std::vector<GoldenPage> GoldenPages() {
  return {
      {"RGB, 11.5 degrees",
       Spec(600, 450, true, false, 255, false, {310, 215, 270, 190, 11.5}, 101), 1},
      {"gray, lid shadow, -23 degrees",
       Spec(640, 480, false, false, 255, true, {300, 250, 300, 200, -23.0}, 102), 1},
      {"RGB with transparency, filter case 5, 4.5 degrees",
       Spec(500, 400, true, true, 60, false, {260, 190, 230, 160, 4.5}, 103), 5},
      {"gray, upright", Spec(560, 420, false, false, 255, false, {280, 200, 250, 180, 0.0}, 104),
       1},
  };
}

}  // namespace AnalysisTest
