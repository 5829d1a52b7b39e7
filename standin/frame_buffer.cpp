// Building, filling and checking the buffers of advance state.
#include "standin/frame_buffer.h"

#include <cstdlib>
#include <cstring>
#include <limits>

#include "standin/host_abi.h"

namespace Standin {

int16_t FrameBuffer::Build(const Document& document, const BufferRequest& request,
                           const BufferLayout& layout, int64_t limitBytes,
                           std::unique_ptr<FrameBuffer>* buffer) {
  buffer->reset();
  if (request.top < 0 || request.left < 0 || request.top > request.bottom ||
      request.left > request.right || request.bottom > document.height ||
      request.right > document.width) {
    return Abi::kParamError;
  }
  if (request.top == request.bottom || request.left == request.right) return Abi::kNoError;
  if (request.loPlane < 0 || request.loPlane > request.hiPlane ||
      request.hiPlane >= document.planes) {
    return Abi::kParamError;
  }
  if (layout.rowPadding < 0 || layout.columnPadding < 0) return Abi::kParamError;

  std::unique_ptr<FrameBuffer> made(new FrameBuffer);
  made->request_ = request;
  made->width_ = request.right - request.left;
  made->height_ = request.bottom - request.top;
  made->planes_ = request.hiPlane - request.loPlane + 1;
  int64_t column = int64_t{made->planes_} + layout.columnPadding;
  int64_t row = made->width_ * column + layout.rowPadding;
  int64_t size = row * made->height_;
  if (row > std::numeric_limits<int32_t>::max() || size > limitBytes) return Abi::kMemoryFull;
  made->columnBytes_ = static_cast<int32_t>(column);
  made->rowBytes_ = static_cast<int32_t>(row);
  made->size_ = size;
  // Exactly the bytes delivered, so that a read past them is caught by the
  // memory checker rather than landing in a neighbouring allocation.
  made->storage_.reset(new (std::nothrow) uint8_t[static_cast<size_t>(size)]);
  if (!made->storage_) return Abi::kMemoryFull;
  made->base_ = made->storage_.get();
  if (layout.bottomUp) {
    made->base_ += (made->height_ - 1) * row;
    made->rowBytes_ = -made->rowBytes_;
  }
  for (int32_t y = 0; y < made->height_; ++y) made->FillRow(document, y);
  *buffer = std::move(made);
  return Abi::kNoError;
}

uint8_t FrameBuffer::Expected(const Document& document, int32_t x, int32_t y, int32_t slot) const {
  if (x >= width_ || slot >= planes_) return kPaddingMarker;
  return document.Sample(request_.top + y, request_.left + x, request_.loPlane + slot);
}

uint8_t FrameBuffer::At(int32_t x, int32_t y, int32_t k) const {
  return RowStart(y)[static_cast<int64_t>(x) * columnBytes_ + k];
}

const uint8_t* FrameBuffer::DirectRow(const Document& document, int32_t y) const {
  // Rows whose pixels lie in the document exactly as delivered can be copied
  // and compared whole.
  if (columnBytes_ != planes_ || request_.loPlane != 0 || planes_ != document.StoredPlanes()) {
    return nullptr;
  }
  const uint8_t* row = document.Row(request_.top + y);
  return row == nullptr ? nullptr : row + static_cast<int64_t>(request_.left) * planes_;
}

void FrameBuffer::FillRow(const Document& document, int32_t y) {
  uint8_t* out = RowStart(y);
  int32_t row = std::abs(rowBytes_);
  int32_t pixels = width_ * columnBytes_;
  if (const uint8_t* source = DirectRow(document, y)) {
    std::memcpy(out, source, static_cast<size_t>(pixels));
  } else {
    for (int32_t offset = 0; offset < pixels; ++offset) {
      out[offset] = Expected(document, offset / columnBytes_, y, offset % columnBytes_);
    }
  }
  std::memset(out + pixels, kPaddingMarker, static_cast<size_t>(row - pixels));
}

int64_t FrameBuffer::FirstChange(const Document& document) const {
  int32_t row = std::abs(rowBytes_);
  int32_t pixels = width_ * columnBytes_;
  for (int32_t y = 0; y < height_; ++y) {
    const uint8_t* bytes = RowStart(y);
    const uint8_t* source = DirectRow(document, y);
    if (source != nullptr && std::memcmp(bytes, source, static_cast<size_t>(pixels)) == 0) {
      bool padding = true;
      for (int32_t offset = pixels; offset < row && padding; ++offset) {
        padding = bytes[offset] == kPaddingMarker;
      }
      if (padding) continue;
    }
    for (int32_t offset = 0; offset < row; ++offset) {
      if (bytes[offset] != Expected(document, offset / columnBytes_, y, offset % columnBytes_)) {
        return (bytes - storage_.get()) + offset;
      }
    }
  }
  return -1;
}

}  // namespace Standin
