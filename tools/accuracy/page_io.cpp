// libvips loading, saving and JPEG round trips.
#include "accuracy/page_io.h"

#include <vips/vips8>

#include <cstdlib>
#include <cstring>
#include <memory>
#include <stdexcept>

namespace Accuracy {
namespace {

PageBuffer FromImage(vips::VImage image) {
  if (image.has_alpha()) image = image.flatten(vips::VImage::option()->set("background", 255.0));
  if (image.interpretation() == VIPS_INTERPRETATION_CMYK || image.bands() == 2 || image.bands() > 3)
    image = image.colourspace(VIPS_INTERPRETATION_sRGB);
  if (image.format() != VIPS_FORMAT_UCHAR) {
    const bool wide = image.format() == VIPS_FORMAT_USHORT;
    image = wide ? (image / 257.0).cast(VIPS_FORMAT_UCHAR) : image.cast(VIPS_FORMAT_UCHAR);
  }
  if (image.bands() != 1 && image.bands() != 3)
    throw std::runtime_error("unsupported number of bands: " + std::to_string(image.bands()));
  PageBuffer page;
  page.width = image.width();
  page.height = image.height();
  page.channels = image.bands();
  size_t size = 0;
  std::unique_ptr<void, decltype(&std::free)> memory(image.write_to_memory(&size), &std::free);
  page.pixels.resize(size);
  std::memcpy(page.pixels.data(), memory.get(), size);
  return page;
}

vips::VImage ToImage(const PageBuffer& page) {
  // new_from_memory does not copy: the copy_memory below detaches the result.
  auto image =
      vips::VImage::new_from_memory(const_cast<uint8_t*>(page.pixels.data()), page.pixels.size(),
                                    page.width, page.height, page.channels, VIPS_FORMAT_UCHAR);
  return image.copy(vips::VImage::option()->set(
      "interpretation", page.channels == 1 ? VIPS_INTERPRETATION_B_W : VIPS_INTERPRETATION_sRGB));
}

bool EndsWith(const std::string& s, const std::string& tail) {
  return s.size() >= tail.size() && s.compare(s.size() - tail.size(), tail.size(), tail) == 0;
}

}  // namespace

void StartImageLibrary(const char* program) {
  if (VIPS_INIT(program) != 0) throw std::runtime_error("libvips failed to start");
}

PageBuffer LoadPage(const std::string& path) {
  try {
    return FromImage(vips::VImage::new_from_file(
        path.c_str(), vips::VImage::option()->set("access", VIPS_ACCESS_SEQUENTIAL)));
  } catch (const vips::VError& e) {
    throw std::runtime_error(path + ": cannot read the image: " + e.what());
  }
}

void SavePage(const PageBuffer& page, const std::string& path, int jpegQuality) {
  try {
    auto image = ToImage(page);
    if (EndsWith(path, ".jpg") || EndsWith(path, ".jpeg")) {
      image.jpegsave(path.c_str(), vips::VImage::option()->set("Q", jpegQuality));
    } else {
      image.pngsave(path.c_str(), vips::VImage::option()->set("compression", 3));
    }
  } catch (const vips::VError& e) {
    throw std::runtime_error(path + ": cannot write the image: " + e.what());
  }
}

PageBuffer JpegRoundTrip(const PageBuffer& page, int quality) {
  void* buffer = nullptr;
  size_t size = 0;
  try {
    ToImage(page).write_to_buffer(".jpg", &buffer, &size,
                                  vips::VImage::option()->set("Q", quality));
    std::unique_ptr<void, decltype(&std::free)> owned(buffer, &std::free);
    return FromImage(vips::VImage::new_from_buffer(owned.get(), size, ""));
  } catch (const vips::VError& e) {
    throw std::runtime_error(std::string("JPEG round trip failed: ") + e.what());
  }
}

}  // namespace Accuracy
