// The document a filter runs on: its size, image mode, planes, the filter
// rectangle and case, the memory budget the host announces, its pixels and its
// data records. Values are kept as the host would write them into the record;
// a test may set any of them to something no real document has.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "standin/data_store.h"

namespace Standin {

// Image modes of the host.
constexpr int16_t kGrayMode = 1;
constexpr int16_t kRgbMode = 3;

class Document {
 public:
  // A document of `channels` colour channels (1: grayscale mode, 3: RGB mode),
  // with a transparency plane after them when `transparency` is set; the filter
  // rectangle is the whole document, the filter case 1 (4 with transparency).
  Document(int32_t width, int32_t height, int channels, bool transparency = false);

  int32_t width = 0;   // columns
  int32_t height = 0;  // rows
  int16_t imageMode = kRgbMode;
  int16_t planes = 3;
  bool transparency = false;
  std::array<int32_t, 4> filterRect{};  // top, left, bottom, right
  int16_t filterCase = 1;
  int32_t maxSpace = 1 << 30;  // the largest memory budget announced at prepare

  // Pixels, the `pixelPlanes` planes of a pixel together (0: as many as the
  // document announces now), `rowBytes` from one row to the next. Without
  // pixels every sample reads as the fill value.
  void SetPixels(std::vector<uint8_t> pixels, std::ptrdiff_t rowBytes, int32_t pixelPlanes = 0);
  // Uses the caller's pixels, which must outlive every run on this document.
  void BorrowPixels(const uint8_t* pixels, std::ptrdiff_t rowBytes, int32_t pixelPlanes = 0);
  void SetFill(uint8_t value) { fill_ = value; }

  // Plane `plane` of pixel (row, column) of the document; planes beyond the
  // stored ones read as 0.
  uint8_t Sample(int32_t row, int32_t column, int32_t plane) const;
  // The stored row, or null when the document has only a fill value.
  const uint8_t* Row(int32_t row) const;
  int32_t StoredPlanes() const { return storedPlanes_; }

  DataStore& Store() { return store_; }
  const DataStore& Store() const { return store_; }

 private:
  std::vector<uint8_t> owned_;
  const uint8_t* pixels_ = nullptr;
  std::ptrdiff_t rowBytes_ = 0;
  int32_t storedPlanes_ = 0;
  uint8_t fill_ = 255;
  DataStore store_;
};

}  // namespace Standin
