// Buffers delivered at advance state: the requested rectangle and planes, in
// the layout the test chooses, and the output buffer watched for changes.
#include <gtest/gtest.h>

#include <cstdlib>

#include "host_fixture.h"

namespace {

using Scripted::Read;
using Scripted::Write;
using Standin::Document;

// Sample of plane p at (row, column): distinct enough to catch a mix-up.
uint8_t Pattern(int32_t row, int32_t column, int32_t plane) {
  return static_cast<uint8_t>(row * 7 + column * 3 + plane * 101);
}

Document PatternDocument() {
  Document document(40, 30, 3, true);  // four planes
  std::vector<uint8_t> pixels(40 * 30 * 4);
  for (int32_t row = 0; row < 30; ++row) {
    for (int32_t column = 0; column < 40; ++column) {
      for (int32_t plane = 0; plane < 4; ++plane) {
        pixels[static_cast<size_t>((row * 40 + column) * 4 + plane)] = Pattern(row, column, plane);
      }
    }
  }
  document.SetPixels(std::move(pixels), 40 * 4);
  return document;
}

// Asks, as a module does, for one rectangle and plane range in both buffers.
void Request(uint8_t* record, int16_t top, int16_t left, int16_t bottom, int16_t right, int16_t lo,
             int16_t hi) {
  for (size_t rect : {64u, 76u}) {
    Write<int16_t>(record, rect, top);
    Write<int16_t>(record, rect + 2, left);
    Write<int16_t>(record, rect + 4, bottom);
    Write<int16_t>(record, rect + 6, right);
  }
  Write<int16_t>(record, 72, lo);
  Write<int16_t>(record, 74, hi);
  Write<int16_t>(record, 84, lo);
  Write<int16_t>(record, 86, hi);
}

class AdvanceState : public ScriptedHostTest {
 protected:
  AdvanceState() : ScriptedHostTest(PatternDocument()) {}

  // Delivers rows 5..25 and columns 10..30, planes 1..3, and checks every sample
  // of both buffers through the record's pointers and distances.
  void DeliverAndCheck() {
    host_.BeginRun();
    int16_t result = During(3, [](Scripted::HostSide& side) {
      uint8_t* record = side.Record();
      Request(record, 5, 10, 25, 30, 1, 3);
      ASSERT_EQ(side.AdvanceState(), 0);
      for (auto [data, row, column] : {std::tuple{88, 96, 368}, std::tuple{100, 108, 372}}) {
        auto* base = Read<uint8_t*>(record, static_cast<size_t>(data));
        int32_t rowBytes = Read<int32_t>(record, static_cast<size_t>(row));
        int32_t columnBytes = Read<int32_t>(record, static_cast<size_t>(column));
        ASSERT_NE(base, nullptr);
        for (int32_t y = 0; y < 20; ++y) {
          for (int32_t x = 0; x < 20; ++x) {
            for (int32_t k = 0; k < 3; ++k) {
              ASSERT_EQ(base[int64_t{y} * rowBytes + int64_t{x} * columnBytes + k],
                        Pattern(5 + y, 10 + x, 1 + k))
                  << "x " << x << " y " << y << " plane " << k;
            }
          }
        }
      }
    });
    EXPECT_EQ(result, 0);
    EXPECT_TRUE(host_.Problems().Empty()) << Problems();
  }
};

TEST_F(AdvanceState, TightLayout) {
  DeliverAndCheck();
  EXPECT_EQ(host_.Input()->RowBytes(), 60);
  EXPECT_EQ(host_.Input()->ColumnBytes(), 3);
}

TEST_F(AdvanceState, PaddedRowsAndColumnsWithMarkedPadding) {
  host_.inputLayout = {.rowPadding = 7, .columnPadding = 2, .bottomUp = false};
  DeliverAndCheck();
  const Standin::FrameBuffer& input = *host_.Input();
  EXPECT_EQ(input.ColumnBytes(), 5);
  EXPECT_EQ(input.RowBytes(), 20 * 5 + 7);
  EXPECT_EQ(input.Base()[3], Standin::kPaddingMarker);
  EXPECT_EQ(input.Base()[20 * 5], Standin::kPaddingMarker);
  EXPECT_EQ(host_.Output()->ColumnBytes(), 3);  // the output keeps its own layout
}

TEST_F(AdvanceState, BottomUpRowsHaveANegativeDistance) {
  host_.inputLayout.bottomUp = true;
  DeliverAndCheck();
  EXPECT_EQ(host_.Input()->RowBytes(), -60);
}

TEST_F(AdvanceState, WritingIntoTheOutputIsReportedButTheInputIsScratch) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    Request(side.Record(), 0, 0, 30, 40, 0, 3);
    ASSERT_EQ(side.AdvanceState(), 0);
    Read<uint8_t*>(side.Record(), 88)[5] = 0;
  });
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
  EXPECT_EQ(host_.Input()->At(1, 0, 1), 0);
  During(4, [](Scripted::HostSide& side) {
    uint8_t* out = Read<uint8_t*>(side.Record(), 100);
    int32_t rowBytes = Read<int32_t>(side.Record(), 108);
    out[29 * rowBytes + 39 * 4 + 3] ^= 1;  // the last byte
  });
  EXPECT_NE(Problems().find("output buffer changed at byte " + std::to_string(30 * 160 - 1)),
            std::string::npos)
      << Problems();
}

TEST_F(AdvanceState, UnmeetableRequestsAreRefusedWithoutBuffers) {
  host_.BeginRun();
  host_.deliveryLimit = 1000;
  During(3, [](Scripted::HostSide& side) {
    uint8_t* record = side.Record();
    Request(record, 0, 0, 31, 40, 0, 3);  // one row too many
    EXPECT_EQ(side.AdvanceState(), -50);
    EXPECT_EQ(Read<void*>(record, 88), nullptr);
    Request(record, 10, 10, 5, 20, 0, 3);  // reversed
    EXPECT_EQ(side.AdvanceState(), -50);
    Request(record, 0, 0, 10, 10, 0, 4);  // a fifth plane
    EXPECT_EQ(side.AdvanceState(), -50);
    Request(record, 0, 0, 30, 40, 0, 3);  // larger than the host will give
    EXPECT_EQ(side.AdvanceState(), -108);
    Request(record, 0, 0, 0, 0, 0, 3);  // nothing asked: nothing given
    EXPECT_EQ(side.AdvanceState(), 0);
    EXPECT_EQ(Read<void*>(record, 88), nullptr);
    EXPECT_EQ(Read<void*>(record, 100), nullptr);
  });
}

TEST_F(AdvanceState, DeliveryHookPlaysABrokenHost) {
  host_.BeginRun();
  host_.deliveryHook = [](Standin::Delivery& delivery, Standin::ByteBlock&) {
    delivery.inData = nullptr;
    delivery.outRowBytes = 1;
  };
  During(3, [](Scripted::HostSide& side) {
    Request(side.Record(), 0, 0, 30, 40, 0, 3);
    EXPECT_EQ(side.AdvanceState(), 0);
    EXPECT_EQ(Read<void*>(side.Record(), 88), nullptr);
    EXPECT_EQ(Read<int32_t>(side.Record(), 108), 1);
    EXPECT_NE(Read<void*>(side.Record(), 100), nullptr);
  });
}

}  // namespace

namespace {

TEST(DocumentPixels, PlanesAnnouncedBeyondThoseStoredReadAsZero) {
  Standin::Document document(4, 2, 3);
  std::vector<uint8_t> pixels(4 * 2 * 3);
  for (size_t i = 0; i < pixels.size(); ++i) pixels[i] = static_cast<uint8_t>(i + 1);
  document.SetPixels(pixels, 12);
  document.planes = 5;  // a host announcing more planes than the pixels carry
  EXPECT_EQ(document.Sample(1, 2, 0), pixels[12 + 6]);
  EXPECT_EQ(document.Sample(1, 2, 2), pixels[12 + 8]);
  EXPECT_EQ(document.Sample(1, 2, 4), 0);

  Standin::Document announced(4, 2, 3);
  announced.planes = 5;
  announced.SetPixels(pixels, 12, 3);  // the layout named outright
  EXPECT_EQ(announced.Sample(1, 3, 1), pixels[12 + 10]);
  EXPECT_EQ(announced.Sample(1, 3, 3), 0);
}

}  // namespace
