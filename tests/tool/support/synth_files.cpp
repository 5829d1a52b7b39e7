// Writing synthetic pages with libvips.
#include "synth_files.h"

#include <stdexcept>

namespace FringeTest {

void EnsureVips() {
  static const bool started = [] {
    if (VIPS_INIT("fringe-tests") != 0) throw std::runtime_error("cannot start libvips");
    vips_cache_set_max(0);
    return true;
  }();
  (void)started;
}

const char* LayoutName(Layout layout) {
  switch (layout) {
    case Layout::Rgb:
      return "rgb";
    case Layout::Gray:
      return "gray";
    case Layout::Palette:
      return "palette";
    case Layout::Cmyk:
      return "cmyk";
    case Layout::Rgb16:
      return "rgb16";
    case Layout::Gray16:
      return "gray16";
    case Layout::RgbAlpha:
      return "rgba";
    case Layout::GrayAlpha:
      return "graya";
  }
  return "?";
}

Synth::PageRecipe PageWithPhoto(int width, int height, double angle, bool photo, uint32_t seed) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.seed = seed;
  if (photo) {
    recipe.photo =
        Synth::PhotoRecipe{width * 0.52, height * 0.47, width * 0.5, height * 0.46, angle};
  }
  return recipe;
}

vips::VImage ImageOf(const Synth::Page& page) {
  EnsureVips();
  vips::VImage image =
      vips::VImage::new_from_memory(const_cast<uint8_t*>(page.pixels.data()), page.pixels.size(),
                                    page.width, page.height, page.channels, VIPS_FORMAT_UCHAR);
  const bool gray = page.channels <= 2;
  return image
      .copy(vips::VImage::option()->set("interpretation",
                                        gray ? VIPS_INTERPRETATION_B_W : VIPS_INTERPRETATION_sRGB))
      .copy_memory();
}

void WritePage(const Synth::Page& page, const std::string& path, Layout layout) {
  vips::VImage image = ImageOf(page);
  switch (layout) {
    case Layout::Rgb:
    case Layout::Gray:
    case Layout::RgbAlpha:
    case Layout::GrayAlpha:
      break;
    case Layout::Palette:
      image.pngsave(path.c_str(), vips::VImage::option()->set("palette", true));
      return;
    case Layout::Cmyk:
      image = image.colourspace(VIPS_INTERPRETATION_CMYK);
      break;
    case Layout::Rgb16:
    case Layout::Gray16:
      image = (image.cast(VIPS_FORMAT_USHORT) * 257)
                  .cast(VIPS_FORMAT_USHORT)
                  .copy(vips::VImage::option()->set(
                      "interpretation", layout == Layout::Rgb16 ? VIPS_INTERPRETATION_RGB16
                                                                : VIPS_INTERPRETATION_GREY16));
      break;
  }
  vips::VOption* options = vips::VImage::option();
  if (path.size() > 5 && path.compare(path.size() - 5, 5, ".webp") == 0) {
    options->set("lossless", true);
  }
  image.write_to_file(path.c_str(), options);
}

}  // namespace FringeTest
