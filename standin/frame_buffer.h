// One buffer the host delivers at advance state: a rectangle of the document
// with a range of planes, laid out with a configurable row distance (padding, or
// bottom-up with a negative distance) and column distance. Padding bytes hold a
// marker, so that a module reading or writing where it should not is seen.
#pragma once

#include <cstdint>
#include <memory>

#include "standin/document.h"

namespace Standin {

struct BufferLayout {
  int32_t rowPadding = 0;     // bytes after each row
  int32_t columnPadding = 0;  // bytes after each pixel's planes
  bool bottomUp = false;      // last row first: the row distance is negative
};

struct BufferRequest {
  int16_t top = 0, left = 0, bottom = 0, right = 0;
  int16_t loPlane = 0, hiPlane = 0;
};

constexpr uint8_t kPaddingMarker = 0xA5;

class FrameBuffer {
 public:
  // Builds the buffer for `request`. Answers 0, or the host code that refuses
  // it: -50 for a rectangle outside the document or a bad plane range, -108 when
  // it would exceed `limitBytes`. An empty rectangle is answered 0 with no buffer.
  static int16_t Build(const Document& document, const BufferRequest& request,
                       const BufferLayout& layout, int64_t limitBytes,
                       std::unique_ptr<FrameBuffer>* buffer);

  uint8_t* Base() { return base_; }
  const uint8_t* Base() const { return base_; }
  int32_t RowBytes() const { return rowBytes_; }
  int32_t ColumnBytes() const { return columnBytes_; }
  int32_t Width() const { return width_; }
  int32_t Height() const { return height_; }
  int32_t Planes() const { return planes_; }
  const BufferRequest& Request() const { return request_; }

  // Plane k (0-based within the delivered range) of pixel (x, y) of the buffer.
  uint8_t At(int32_t x, int32_t y, int32_t k) const;
  // Offset from the start of storage of the first byte that differs from what
  // was delivered, or -1 when the buffer is as delivered.
  int64_t FirstChange(const Document& document) const;

 private:
  FrameBuffer() = default;
  uint8_t Expected(const Document& document, int32_t x, int32_t y, int32_t slot) const;
  const uint8_t* DirectRow(const Document& document, int32_t y) const;
  void FillRow(const Document& document, int32_t y);
  uint8_t* RowStart(int32_t y) { return base_ + static_cast<int64_t>(y) * rowBytes_; }
  const uint8_t* RowStart(int32_t y) const { return base_ + static_cast<int64_t>(y) * rowBytes_; }

  BufferRequest request_;
  int32_t width_ = 0, height_ = 0, planes_ = 0;
  int32_t rowBytes_ = 0, columnBytes_ = 0;
  int64_t size_ = 0;
  std::unique_ptr<uint8_t[]> storage_;
  uint8_t* base_ = nullptr;
};

}  // namespace Standin
