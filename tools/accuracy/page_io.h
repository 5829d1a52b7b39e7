// Pages in and out of image files through libvips: any file libvips loads
// becomes an 8-bit gray or RGB interleaved buffer; pages are written as PNG
// or JPEG; a JPEG round trip adds compression artefacts to a page.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "refine/page_image.h"

namespace Accuracy {

struct PageBuffer {
  int width = 0;
  int height = 0;
  int channels = 0;  // 1 gray or 3 RGB
  std::vector<uint8_t> pixels;

  Refine::PageImage View() const {
    return {width,    height,        channels,
            channels, pixels.data(), static_cast<std::ptrdiff_t>(width) * channels};
  }
};

// Starts libvips once per process; call before any other function here.
void StartImageLibrary(const char* program);

// Throws std::runtime_error naming the file and the reason.
PageBuffer LoadPage(const std::string& path);

// PNG unless the name ends in .jpg/.jpeg (then JPEG of the given quality).
void SavePage(const PageBuffer& page, const std::string& path, int jpegQuality = 90);

// The page after being stored as a JPEG of the given quality and read back.
PageBuffer JpegRoundTrip(const PageBuffer& page, int quality);

}  // namespace Accuracy
