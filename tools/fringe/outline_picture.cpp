// Drawing the outline on a mask and laying it over the page.
#include "outline_picture.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>

namespace Fringe {

namespace {

constexpr double kOutlineInk = 1.0;
constexpr double kFirstCornerInk = 2.0;

void DrawThickLine(const vips::VImage& mask, Corner a, Corner b, int thickness) {
  // Thicken across the line: vertically for flat lines, sideways for steep ones.
  const bool steep = std::abs(b.y - a.y) > std::abs(b.x - a.x);
  for (int o = -(thickness / 2); o < thickness - thickness / 2; ++o) {
    const int ox = steep ? o : 0, oy = steep ? 0 : o;
    mask.draw_line({kOutlineInk}, a.x + ox, a.y + oy, b.x + ox, b.y + oy);
  }
}

}  // namespace

vips::VImage OutlinePicture(const DecodedPage& page, const PhotoOutline& outline) {
  const int thickness = std::max(2, static_cast<int>(std::min(page.width, page.height) / 300));
  vips::VImage mask = vips::VImage::black(page.width, page.height).copy_memory();
  for (int k = 0; k < 4; ++k) {
    DrawThickLine(mask, outline.corners[k], outline.corners[(k + 1) % 4], thickness);
  }
  const int radius = 3 * thickness;
  for (int k = 3; k >= 0; --k) {
    mask.draw_circle({k == 0 ? kFirstCornerInk : kOutlineInk}, outline.corners[k].x,
                     outline.corners[k].y, radius, vips::VImage::option()->set("fill", true));
  }

  vips::VImage base = page.image;
  if (page.alpha) {
    base = base.flatten(vips::VImage::option()->set("background", std::vector<double>{255.0}));
  }
  if (page.channels == 1) {
    base = base.colourspace(VIPS_INTERPRETATION_sRGB);
    // A grayscale profile does not describe the RGB picture.
    base = base.copy();
    base.remove("icc-profile-data");
  }
  base = base.cast(VIPS_FORMAT_UCHAR);
  const vips::VImage red = (mask == kOutlineInk).ifthenelse(std::vector<double>{255, 0, 0}, base);
  return (mask == kFirstCornerInk).ifthenelse(std::vector<double>{0, 200, 0}, red);
}

}  // namespace Fringe
