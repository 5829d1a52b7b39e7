// Writes a folder of synthetic scans for measuring batches: COUNT JPEG pages,
// photos at angles from -30 to 30 degrees, every tenth page without a photo.
// Usage: fringe_make_pages DIR COUNT [WIDTH HEIGHT]
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>

#include "synth_files.h"

int main(int argc, char** argv) {
  if (argc != 3 && argc != 5) {
    std::fprintf(stderr, "usage: %s DIR COUNT [WIDTH HEIGHT]\n", argv[0]);
    return 64;
  }
  const std::string dir = argv[1];
  const int count = std::atoi(argv[2]);
  const int width = argc == 5 ? std::atoi(argv[3]) : 2000;
  const int height = argc == 5 ? std::atoi(argv[4]) : 1500;
  if (count < 1 || width < 1 || height < 1) {
    std::fprintf(stderr, "COUNT, WIDTH and HEIGHT must be positive\n");
    return 64;
  }
  try {
    std::filesystem::create_directories(dir);
    for (int i = 0; i < count; ++i) {
      const double angle = -30.0 + 60.0 * ((i * 37) % 101) / 100.0;
      Synth::PageRecipe recipe = FringeTest::PageWithPhoto(width, height, angle, i % 10 != 9,
                                                           static_cast<uint32_t>(i + 1));
      recipe.lidShadow = i % 3 == 0;
      char name[32];
      std::snprintf(name, sizeof name, "/page%04d.jpg", i);
      FringeTest::ImageOf(Synth::GeneratePage(recipe))
          .jpegsave((dir + name).c_str(), vips::VImage::option()->set("Q", 90));
    }
  } catch (const std::exception& e) {
    std::fprintf(stderr, "%s\n", e.what());
    return 70;
  }
  return 0;
}
