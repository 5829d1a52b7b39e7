// Writes the sample scan that the repository carries: a synthetic 1200 x 900
// page with a photo turned by a few degrees, as a JPEG, and prints the photo's
// true corners. Usage: fringe_make_sample OUT.jpg
#include <cstdio>

#include "synth_files.h"

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: %s OUT.jpg\n", argv[0]);
    return 64;
  }
  try {
    Synth::PageRecipe recipe;
    recipe.width = 1200;
    recipe.height = 900;
    recipe.photo = Synth::PhotoRecipe{585.0, 430.0, 640.0, 440.0, 6.5};
    recipe.lidShadow = true;
    recipe.noise = 2.5;
    recipe.seed = 2024;
    const Synth::Page page = Synth::GeneratePage(recipe);
    FringeTest::ImageOf(page).jpegsave(argv[1], vips::VImage::option()->set("Q", 88));
    for (const auto& c : page.corners) std::printf("(%.2f, %.2f) ", c[0], c[1]);
    std::printf("\n");
  } catch (const std::exception& e) {
    std::fprintf(stderr, "%s\n", e.what());
    return 70;
  }
  return 0;
}
