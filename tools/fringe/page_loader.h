// Reading an image file into the one in-memory frame that detection, drawing
// and cropping all work from: 8-bit samples, grayscale or sRGB, optional alpha.
#pragma once

#include <cstdint>
#include <string>

#include <vips/vips8>

namespace Fringe {

struct LoadLimits {
  uint64_t maxPixels = 0;  // refuse a file whose header promises more pixels
  int32_t maxSide = 0;     // 0: refuse sides above the module's limit
};

// The largest page side the module takes (its coordinates are 16-bit).
inline constexpr int32_t kModuleMaxSide = 32767;

struct DecodedPage {
  vips::VImage image;  // in memory, 8-bit, channels (+1 when alpha) bands
  int32_t width = 0;
  int32_t height = 0;
  int channels = 0;  // 1 gray, 3 RGB
  bool alpha = false;
  std::string format;            // loader family, e.g. "jpeg", "png"
  bool colourConverted = false;  // samples were moved into sRGB (e.g. from CMYK)

  const uint8_t* Pixels() const;
  std::ptrdiff_t RowBytes() const;
};

// Throws PageError(BadInput) naming the reason when the file cannot be used.
DecodedPage LoadPage(const std::string& path, const LoadLimits& limits);

// A copy of the page whose longer side is at most maxSide, in memory.
vips::VImage DownscaledCopy(const DecodedPage& page, int32_t maxSide);

}  // namespace Fringe
