// Test support: in-memory frames laid out like a host's buffers (padded rows,
// bottom-up rows, wide pixels) and an AnalysisHost that counts every call.
#pragma once

#include <cstdint>
#include <functional>
#include <stdexcept>
#include <vector>

#include "filter/analysis/frame.h"
#include "synth/page_generator.h"

namespace AnalysisTest {

struct Layout {
  int32_t rowPadding = 0;    // bytes after each row
  int32_t pixelPadding = 0;  // bytes after each pixel's planes
  bool bottomUp = false;     // negative row distance, last row first in memory
};

// One host buffer holding width x height pixels of `planes` bytes each.
class Buffer {
 public:
  Buffer(int32_t width, int32_t height, int32_t planes, const Layout& layout, uint8_t fill = 255);

  uint8_t* Pixel(int32_t x, int32_t y);
  const uint8_t* Pixel(int32_t x, int32_t y) const;
  uint8_t* Base() { return base_; }
  int32_t RowBytes() const { return rowBytes_; }
  int32_t ColumnBytes() const { return columnBytes_; }
  const std::vector<uint8_t>& Storage() const { return storage_; }

 private:
  std::vector<uint8_t> storage_;
  uint8_t* base_ = nullptr;
  int32_t rowBytes_ = 0;
  int32_t columnBytes_ = 0;
};

// An input and an output buffer holding the same pixels, and the FrameView
// over them, as a host delivers a frame after advance state.
class TestFrame {
 public:
  // colorChannels 1 (image mode 1) or 3 (image mode 3); alpha adds a plane.
  TestFrame(int32_t width, int32_t height, int32_t colorChannels, bool alpha = false,
            const Layout& layout = {});
  // A frame holding a synthetic page.
  explicit TestFrame(const Synth::Page& page, const Layout& layout = {});

  // Sets channel k of pixel (x, y) in both buffers.
  void Set(int32_t x, int32_t y, int32_t k, uint8_t value);
  // Sets every colour channel of pixel (x, y) to value in both buffers.
  void SetGray(int32_t x, int32_t y, uint8_t value);
  void Fill(uint8_t value);
  void FillRect(int32_t x0, int32_t y0, int32_t x1, int32_t y1, uint8_t value);

  // The edge-map plane as the stages see it.
  uint8_t MapAt(int32_t x, int32_t y) const { return input_.Pixel(x, y)[0]; }
  void SetMap(int32_t x, int32_t y, uint8_t value) { input_.Pixel(x, y)[0] = value; }

  Buffer& Input() { return input_; }
  Buffer& Output() { return output_; }
  Project::FrameView& View() { return view_; }
  int32_t Width() const { return width_; }
  int32_t Height() const { return height_; }
  int32_t Planes() const { return planes_; }

 private:
  void MakeView(int32_t colorChannels);

  int32_t width_;
  int32_t height_;
  int32_t planes_;
  Buffer input_;
  Buffer output_;
  Project::FrameView view_;
};

struct RecordWrite {
  bool empty = false;
  Project::CornerQuad corners{};
  int16_t confidence = 0;
};

// Counts and records every call the analysis makes on its host.
class CountingHost : public Project::AnalysisHost {
 public:
  bool TestAbort() override;
  void ReportProgress(int32_t done, int32_t total) override;
  void SetResultCode(int16_t code) override;
  void WriteFringeRecord(const Project::CornerQuad& corners, int16_t confidence) override;
  void WriteEmptyFringeRecord() override;

  // The abort test answers true from its n-th call on (1-based); 0: never.
  int32_t cancelAtCall = 0;
  // The record writers throw this (a host error stand-in) when set.
  bool throwOnWrite = false;

  int32_t abortCalls = 0;
  int32_t progressCalls = 0;
  int32_t lastDone = 0;
  int32_t lastTotal = 0;
  bool progressInOrder = true;  // every call reports done one above the last
  int32_t resultCodeWrites = 0;
  int16_t resultCode = 0;
  std::vector<RecordWrite> records;
};

// What CountingHost throws from a record writer.
struct HostWriteError : std::runtime_error {
  HostWriteError() : std::runtime_error("record store refused") {}
};

}  // namespace AnalysisTest
