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
  if (!(x >= 0.0) || !(y >= 0.0)) return false;  // also rejects NaN
  const double maxX = static_cast<double>(page_.width - 1);
  const double maxY = static_cast<double>(page_.height - 1);
  if (x > maxX || y > maxY) return false;
  auto x0 = static_cast<int32_t>(x);
  auto y0 = static_cast<int32_t>(y);
  const double fx = x - x0;
  const double fy = y - y0;
  const int32_t x1 = x0 + 1 < page_.width ? x0 + 1 : x0;
  const int32_t y1 = y0 + 1 < page_.height ? y0 + 1 : y0;
  const double top = Pixel(x0, y0) + (Pixel(x1, y0) - Pixel(x0, y0)) * fx;
  const double bottom = Pixel(x0, y1) + (Pixel(x1, y1) - Pixel(x0, y1)) * fx;
  value = top + (bottom - top) * fy;
  return true;
}

}  // namespace Refine
