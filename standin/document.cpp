// Document pixels and defaults.
#include "standin/document.h"

namespace Standin {

Document::Document(int32_t width_, int32_t height_, int channels, bool transparency_)
    : width(width_),
      height(height_),
      imageMode(channels == 1 ? kGrayMode : kRgbMode),
      planes(static_cast<int16_t>(channels + (transparency_ ? 1 : 0))),
      transparency(transparency_),
      filterRect{0, 0, height_, width_},
      filterCase(static_cast<int16_t>(transparency_ ? 4 : 1)) {}

void Document::SetPixels(std::vector<uint8_t> pixels, std::ptrdiff_t rowBytes,
                         int32_t pixelPlanes) {
  owned_ = std::move(pixels);
  BorrowPixels(owned_.data(), rowBytes, pixelPlanes);
}

void Document::BorrowPixels(const uint8_t* pixels, std::ptrdiff_t rowBytes, int32_t pixelPlanes) {
  pixels_ = pixels;
  rowBytes_ = rowBytes;
  storedPlanes_ = pixelPlanes > 0 ? pixelPlanes : planes;
}

uint8_t Document::Sample(int32_t row, int32_t column, int32_t plane) const {
  if (pixels_ == nullptr) return fill_;
  if (plane >= storedPlanes_) return 0;
  return pixels_[row * rowBytes_ + static_cast<std::ptrdiff_t>(column) * storedPlanes_ + plane];
}

const uint8_t* Document::Row(int32_t row) const {
  return pixels_ == nullptr ? nullptr : pixels_ + row * rowBytes_;
}

}  // namespace Standin
