// Straightening the photo with one affine resampling.
#include "straightened_photo.h"

namespace Fringe {

vips::VImage StraightenedPhoto(const DecodedPage& page, const PhotoFrame& frame) {
  const AffineMap map = StraighteningMap(frame);
  // White outside the page; fully transparent (all zero, premultiplied) with alpha.
  std::vector<double> background(static_cast<size_t>(page.channels), page.alpha ? 0.0 : 255.0);
  if (page.alpha) background.push_back(0.0);

  vips::VImage in = page.image;
  // Interpolating premultiplied samples keeps transparent pixels' colours
  // from bleeding into the photo's edge.
  if (page.alpha) in = in.premultiply();
  vips::VImage out =
      in.affine({map.matrix[0], map.matrix[1], map.matrix[2], map.matrix[3]},
                vips::VImage::option()
                    ->set("interpolate", vips::VInterpolate::new_from_name("bicubic"))
                    ->set("oarea", std::vector<int>{0, 0, frame.width, frame.height})
                    ->set("odx", map.odx)
                    ->set("ody", map.ody)
                    ->set("extend", VIPS_EXTEND_BACKGROUND)
                    ->set("background", background));
  if (page.alpha) out = out.unpremultiply();
  return out.cast(VIPS_FORMAT_UCHAR);
}

}  // namespace Fringe
