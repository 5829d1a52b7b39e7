// Checks of a page view and bilinear gray sampling.
#include "refine/page_image.h"

#include <cmath>
#include <cstdlib>

namespace Refine {

std::string CheckPageImage(const PageImage& page) {
  if (page.pixels == nullptr) return "the page has no pixels";
  if (page.width < 1 || page.height < 1) return "the page is empty";
  if (page.channels != 1 && page.channels != 3) return "the page is neither gray nor RGB";
  if (page.pixelBytes < page.channels) return "a pixel is narrower than its channels";
  const std::ptrdiff_t rowNeeded = static_cast<std::ptrdiff_t>(page.width) * page.pixelBytes;
  if (std::llabs(static_cast<long long>(page.rowBytes)) < rowNeeded)
    return "a row is narrower than its pixels";
  return {};
}

bool GraySampler::Sample(double x, double y, double& value) const {
  if (!Inside(x, y)) return false;  // also rejects NaN
  value = SampleInside(x, y);
  return true;
}

double GraySampler::SampleInside(double x, double y) const {
  const auto x0 = static_cast<int32_t>(x);
  const auto y0 = static_cast<int32_t>(y);
  const double fx = x - x0;
  const double fy = y - y0;
  const uint8_t* p = page_.pixels + static_cast<std::ptrdiff_t>(y0) * page_.rowBytes +
                     static_cast<std::ptrdiff_t>(x0) * page_.pixelBytes;
  // On the last column or row the neighbour is the pixel itself.
  const std::ptrdiff_t right = x0 + 1 < page_.width ? page_.pixelBytes : 0;
  const std::ptrdiff_t down = y0 + 1 < page_.height ? page_.rowBytes : 0;
  double a, b, c, d;
  if (page_.channels == 1) {
    a = p[0];
    b = p[right];
    c = p[down];
    d = p[down + right];
  } else {
    a = p[0] + p[1] + p[2];
    b = p[right] + p[right + 1] + p[right + 2];
    c = p[down] + p[down + 1] + p[down + 2];
    d = p[down + right] + p[down + right + 1] + p[down + right + 2];
  }
  const double top = a + (b - a) * fx;
  const double bottom = c + (d - c) * fx;
  const double value = top + (bottom - top) * fy;
  return page_.channels == 1 ? value : value * (1.0 / 3.0);
}

}  // namespace Refine
