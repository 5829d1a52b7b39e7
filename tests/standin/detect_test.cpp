// Detect over a module scripted to answer like a detector: the page reaches the
// module as a document, and what the module publishes comes back.
#include <gtest/gtest.h>

#include "scripted_module.h"
#include "standin/detect.h"

namespace {

using Scripted::Read;

struct Seen {
  int calls = 0;
  int16_t mode = 0, planes = 0, filterCase = 0, rows = 0, columns = 0;
  std::array<int16_t, 4> rect{};
  bool pixelsMatch = false;
};

std::vector<uint8_t> MakePixels(int width, int height, int planes) {
  std::vector<uint8_t> pixels(static_cast<size_t>(width * height * planes));
  for (size_t i = 0; i < pixels.size(); ++i) pixels[i] = static_cast<uint8_t>(i * 13 + 5);
  return pixels;
}

// Publishes a fixed record and descriptor, and notes what it saw of the page.
void ScriptDetector(Seen& seen, const std::vector<uint8_t>& pixels, int width, bool descriptor) {
  Scripted::SetScript([&seen, &pixels, width, descriptor](int16_t selector, uint8_t* record,
                                                          int16_t*) {
    ++seen.calls;
    Scripted::HostSide side(record);
    if (selector == 3) {
      seen.mode = Read<int16_t>(record, 156);
      seen.planes = Read<int16_t>(record, 32);
      seen.filterCase = Read<int16_t>(record, 268);
      seen.rows = Read<int16_t>(record, 28);
      seen.columns = Read<int16_t>(record, 30);
      for (size_t i = 0; i < 4; ++i) seen.rect[i] = Read<int16_t>(record, 34 + 2 * i);
      for (size_t rect : {64u, 76u}) {
        for (size_t i = 0; i < 4; ++i) Scripted::Write<int16_t>(record, rect + 2 * i, seen.rect[i]);
      }
      Scripted::Write<int16_t>(record, 74, static_cast<int16_t>(seen.planes - 1));
      Scripted::Write<int16_t>(record, 86, static_cast<int16_t>(seen.planes - 1));
      if (side.AdvanceState() == 0) {
        auto* in = Read<uint8_t*>(record, 88);
        int32_t rowBytes = Read<int32_t>(record, 96);
        seen.pixelsMatch = true;
        for (int y = 0; y < seen.rect[2] - seen.rect[0]; ++y) {
          for (int x = 0; x < (seen.rect[3] - seen.rect[1]) * seen.planes; ++x) {
            size_t page =
                static_cast<size_t>(((seen.rect[0] + y) * width + seen.rect[1]) * seen.planes + x);
            seen.pixelsMatch &= in[y * rowBytes + x] == pixels[page];
          }
        }
      }
      std::vector<uint8_t> bytes(18);
      for (size_t i = 0; i < 9; ++i) bytes[2 * i] = static_cast<uint8_t>(i + 1);
      side.Publish(0x66524E47, bytes);
    }
    if (selector == 5 && descriptor) {
      void* token = side.OpenWrite();
      side.PutFloat(token, 0x616E676C, -1.25);
      const char* keys[] = {"conf", "pt1v", "pt1h", "pt2v", "pt2h", "pt3v", "pt3h", "pt4v", "pt4h"};
      for (int i = 0; i < 9; ++i) {
        const char* k = keys[i];
        uint32_t key = static_cast<uint32_t>(k[0]) << 24 | static_cast<uint32_t>(k[1]) << 16 |
                       static_cast<uint32_t>(k[2]) << 8 | static_cast<uint32_t>(k[3]);
        side.PutInteger(token, key, 100 * i - 1);
      }
      side.CloseWrite(token, static_cast<void**>(static_cast<void*>(
                                 static_cast<uint8_t*>(side.DescriptorBlock()) + 8)));
    }
  });
}

class DetectTest : public ::testing::Test {
 protected:
  ~DetectTest() override { Scripted::SetScript(nullptr); }
  std::unique_ptr<Standin::Module> module_ = Scripted::MakeModule();
  Seen seen_;
};

TEST_F(DetectTest, GrayPageRunsWholeAndReadsBackRecordAndDescriptor) {
  std::vector<uint8_t> pixels = MakePixels(50, 40, 1);
  ScriptDetector(seen_, pixels, 50, true);
  Standin::PageView page{50, 40, 1, false, pixels.data(), 50};
  Standin::Detection detection = Standin::Detect(*module_, page);
  EXPECT_EQ(detection.error, "");
  EXPECT_EQ(seen_.calls, 5);
  EXPECT_EQ(detection.selectorResults, (std::array<int16_t, 6>{}));
  EXPECT_EQ(seen_.mode, 1);
  EXPECT_EQ(seen_.planes, 1);
  EXPECT_EQ(seen_.filterCase, 1);
  EXPECT_EQ(seen_.rows, 40);
  EXPECT_EQ(seen_.columns, 50);
  EXPECT_TRUE(seen_.pixelsMatch);
  ASSERT_TRUE(detection.recordPresent);
  EXPECT_EQ(detection.record, (std::array<int16_t, 9>{1, 2, 3, 4, 5, 6, 7, 8, 9}));
  ASSERT_TRUE(detection.descriptorPresent);
  EXPECT_EQ(detection.angle, -1.25);
  EXPECT_EQ(detection.confidence, -1);
  EXPECT_EQ(detection.points, (std::array<int32_t, 8>{99, 199, 299, 399, 499, 599, 699, 799}));
}

TEST_F(DetectTest, RgbPageWithAlphaAndASelection) {
  std::vector<uint8_t> pixels = MakePixels(60, 45, 4);
  ScriptDetector(seen_, pixels, 60, true);
  Standin::PageView page{60, 45, 3, true, pixels.data(), 60 * 4};
  Standin::Detection detection =
      Standin::Detect(*module_, page, {.filterRect = std::array<int32_t, 4>{5, 6, 40, 50}});
  EXPECT_EQ(detection.error, "");
  EXPECT_EQ(seen_.mode, 3);
  EXPECT_EQ(seen_.planes, 4);
  EXPECT_EQ(seen_.filterCase, 5);
  EXPECT_EQ(seen_.rect, (std::array<int16_t, 4>{5, 6, 40, 50}));
  EXPECT_TRUE(seen_.pixelsMatch);
}

TEST_F(DetectTest, MissingDescriptorIsAnError) {
  std::vector<uint8_t> pixels = MakePixels(30, 30, 3);
  ScriptDetector(seen_, pixels, 30, false);
  Standin::Detection detection = Standin::Detect(*module_, {30, 30, 3, false, pixels.data(), 90});
  EXPECT_TRUE(detection.recordPresent);
  EXPECT_FALSE(detection.descriptorPresent);
  EXPECT_EQ(detection.error, "the module wrote no result descriptor");
}

TEST_F(DetectTest, FailingSelectorIsNamed) {
  Scripted::SetScript([this](int16_t selector, uint8_t*, int16_t* result) {
    ++seen_.calls;
    if (selector == 3) *result = -108;
  });
  std::vector<uint8_t> pixels(900);
  Standin::Detection detection = Standin::Detect(*module_, {30, 30, 1, false, pixels.data(), 30});
  EXPECT_EQ(seen_.calls, 3);  // no continue, no finish after a failed start
  EXPECT_EQ(detection.selectorResults[3], -108);
  EXPECT_EQ(detection.error.rfind("the start selector answered -108", 0), 0u) << detection.error;
}

TEST_F(DetectTest, UnusablePagesAreRefusedWithoutARun) {
  Scripted::SetScript([this](int16_t, uint8_t*, int16_t*) { ++seen_.calls; });
  uint8_t pixel = 0;
  const std::pair<Standin::PageView, const char*> cases[] = {
      {{32768, 10, 1, false, &pixel, 32768}, "at most 32767 on a side"},
      {{10, 32768, 1, false, &pixel, 10}, "at most 32767 on a side"},
      {{0, 10, 1, false, &pixel, 10}, "empty"},
      {{10, 10, 2, false, &pixel, 20}, "only 1 (gray) or 3 (RGB)"},
      {{10, 10, 3, false, nullptr, 30}, "no pixels"},
      {{10, 10, 3, true, &pixel, 30}, "less than a row of pixels (40 bytes)"},
  };
  for (const auto& [page, reason] : cases) {
    Standin::Detection detection = Standin::Detect(*module_, page);
    EXPECT_NE(detection.error.find(reason), std::string::npos) << detection.error;
  }
  std::vector<uint8_t> pixels(100);
  Standin::Detection detection = Standin::Detect(*module_, {10, 10, 1, false, pixels.data(), 10},
                                                 {std::array<int32_t, 4>{0, 0, 11, 10}});
  EXPECT_NE(detection.error.find("not inside the page"), std::string::npos) << detection.error;
  EXPECT_EQ(seen_.calls, 0);
}

}  // namespace
