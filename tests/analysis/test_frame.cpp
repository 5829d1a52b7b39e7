// In-memory frames and the counting host.
#include "test_frame.h"

#include <cstddef>

namespace AnalysisTest {

Buffer::Buffer(int32_t width, int32_t height, int32_t planes, const Layout& layout, uint8_t fill)
    : columnBytes_(planes + layout.pixelPadding) {
  const int32_t stride = width * columnBytes_ + layout.rowPadding;
  storage_.assign(static_cast<std::size_t>(stride) * static_cast<std::size_t>(height), fill);
  if (layout.bottomUp) {
    base_ = storage_.data() + static_cast<std::ptrdiff_t>(height - 1) * stride;
    rowBytes_ = -stride;
  } else {
    base_ = storage_.data();
    rowBytes_ = stride;
  }
}

uint8_t* Buffer::Pixel(int32_t x, int32_t y) {
  return base_ + static_cast<std::ptrdiff_t>(y) * rowBytes_ +
         static_cast<std::ptrdiff_t>(x) * columnBytes_;
}

const uint8_t* Buffer::Pixel(int32_t x, int32_t y) const {
  return base_ + static_cast<std::ptrdiff_t>(y) * rowBytes_ +
         static_cast<std::ptrdiff_t>(x) * columnBytes_;
}

TestFrame::TestFrame(int32_t width, int32_t height, int32_t colorChannels, bool alpha,
                     const Layout& layout)
    : width_(width),
      height_(height),
      planes_(colorChannels + (alpha ? 1 : 0)),
      input_(width, height, planes_, layout),
      output_(width, height, planes_, layout) {
  MakeView(colorChannels);
}

TestFrame::TestFrame(const Synth::Page& page, const Layout& layout)
    : TestFrame(page.width, page.height,
                page.channels == 2 || page.channels == 4 ? page.channels - 1 : page.channels,
                page.channels == 2 || page.channels == 4, layout) {
  const uint8_t* source = page.pixels.data();
  for (int32_t y = 0; y < height_; ++y) {
    for (int32_t x = 0; x < width_; ++x) {
      for (int32_t k = 0; k < planes_; ++k) {
        input_.Pixel(x, y)[k] = source[k];
        output_.Pixel(x, y)[k] = source[k];
      }
      source += planes_;
    }
  }
}

void TestFrame::MakeView(int32_t colorChannels) {
  view_.imageMode = colorChannels == 1 ? 1 : 3;
  view_.filterCase = planes_ > colorChannels ? 4 : 1;
  view_.planes = static_cast<int16_t>(planes_);
  view_.documentRows = static_cast<int16_t>(height_);
  view_.documentColumns = static_cast<int16_t>(width_);
  view_.inRect = {0, 0, static_cast<int16_t>(height_), static_cast<int16_t>(width_)};
  view_.outRect = view_.inRect;
  view_.inData = input_.Base();
  view_.inRowBytes = input_.RowBytes();
  view_.inColumnBytes = input_.ColumnBytes();
  view_.outData = output_.Base();
  view_.outRowBytes = output_.RowBytes();
  view_.outColumnBytes = output_.ColumnBytes();
}

void TestFrame::Set(int32_t x, int32_t y, int32_t k, uint8_t value) {
  input_.Pixel(x, y)[k] = value;
  output_.Pixel(x, y)[k] = value;
}

void TestFrame::SetGray(int32_t x, int32_t y, uint8_t value) {
  const int32_t colors = view_.imageMode == 1 ? 1 : 3;
  for (int32_t k = 0; k < colors; ++k) Set(x, y, k, value);
}

void TestFrame::Fill(uint8_t value) {
  FillRect(0, 0, width_, height_, value);
}

void TestFrame::FillRect(int32_t x0, int32_t y0, int32_t x1, int32_t y1, uint8_t value) {
  for (int32_t y = y0; y < y1; ++y) {
    for (int32_t x = x0; x < x1; ++x) SetGray(x, y, value);
  }
}

bool CountingHost::TestAbort() {
  ++abortCalls;
  return cancelAtCall > 0 && abortCalls >= cancelAtCall;
}

void CountingHost::ReportProgress(int32_t done, int32_t total) {
  if (done != lastDone + 1) progressInOrder = false;
  ++progressCalls;
  lastDone = done;
  lastTotal = total;
}

void CountingHost::SetResultCode(int16_t code) {
  ++resultCodeWrites;
  resultCode = code;
}

void CountingHost::WriteFringeRecord(const Project::CornerQuad& corners, int16_t confidence) {
  if (throwOnWrite) throw HostWriteError();
  records.push_back({false, corners, confidence});
}

void CountingHost::WriteEmptyFringeRecord() {
  if (throwOnWrite) throw HostWriteError();
  records.push_back({true, {}, 0});
}

}  // namespace AnalysisTest
