// A read-only view of an 8-bit interleaved page (gray or RGB, optionally with
// a trailing alpha byte per pixel) and bilinear gray sampling over it.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace Refine {

struct PageImage {
  int32_t width = 0;
  int32_t height = 0;
  int channels = 0;    // colour channels: 1 gray, 3 RGB
  int pixelBytes = 0;  // bytes from one pixel to the next (channels, +1 with alpha)
  const uint8_t* pixels = nullptr;
  std::ptrdiff_t rowBytes = 0;
};

// Empty when the view can be read safely; otherwise what is wrong with it.
std::string CheckPageImage(const PageImage& page);

// Gray values (mean of the colour channels) with pixel centres at integer
// coordinates: pixel (x, y) covers [x - 0.5, x + 0.5] x [y - 0.5, y + 0.5].
class GraySampler {
 public:
  explicit GraySampler(const PageImage& page) : page_(page) {}

  int32_t Width() const { return page_.width; }
  int32_t Height() const { return page_.height; }

  double Pixel(int32_t x, int32_t y) const {
    const uint8_t* p = page_.pixels + static_cast<std::ptrdiff_t>(y) * page_.rowBytes +
                       static_cast<std::ptrdiff_t>(x) * page_.pixelBytes;
    if (page_.channels == 1) return p[0];
    return (p[0] + p[1] + p[2]) * (1.0 / 3.0);
  }

  // Bilinear value at (x, y); false when the point lies outside the pixel centres' hull.
  bool Sample(double x, double y, double& value) const;

  // True when (x, y) lies inside the pixel centres' hull.
  bool Inside(double x, double y) const {
    return x >= 0.0 && y >= 0.0 && x <= page_.width - 1 && y <= page_.height - 1;
  }

  // Bilinear value at a point known to be Inside.
  double SampleInside(double x, double y) const;

 private:
  PageImage page_;
};

}  // namespace Refine
