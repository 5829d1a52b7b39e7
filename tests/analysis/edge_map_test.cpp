// The thresholded Sobel edge map.
#include <gtest/gtest.h>

#include <vector>

#include "filter/analysis/edge_map.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::TestFrame;

// Marks every map byte with a value the stage never writes, so that written
// and untouched positions can be told apart.
void MarkMap(TestFrame& frame) {
  for (int y = 0; y < frame.Height(); ++y) {
    for (int x = 0; x < frame.Width(); ++x) frame.SetMap(x, y, 77);
  }
}

int RunEdgeMap(TestFrame& frame, CountingHost& host) {
  ProgressCounter progress{10000, 0};
  BuildEdgeMap(frame.View(), host, 60, progress);
  return progress.done;
}

// A vertical step: columns below `at` hold `low`, the rest `high`.
void VerticalStep(TestFrame& frame, int at, uint8_t low, uint8_t high) {
  frame.FillRect(0, 0, at, frame.Height(), low);
  frame.FillRect(at, 0, frame.Width(), frame.Height(), high);
}

TEST(EdgeMapTest, FlatFrameMarksTheComputedRegionOnly) {
  TestFrame frame(27, 27, 1);
  frame.Fill(128);
  MarkMap(frame);
  CountingHost host;
  EXPECT_EQ(RunEdgeMap(frame, host), 23);  // rows 1 ... 23
  EXPECT_EQ(host.abortCalls, 23);
  for (int y = 0; y < 27; ++y) {
    for (int x = 0; x < 27; ++x) {
      const bool computed = y >= 1 && y <= 23 && x >= 1 && x <= 21;
      EXPECT_EQ(frame.MapAt(x, y), computed ? 255 : 77) << x << "," << y;
    }
  }
}

TEST(EdgeMapTest, GrayStepOf46IsAnEdgeAnd45IsNot) {
  for (int rise : {46, 45}) {
    TestFrame frame(30, 30, 1);
    VerticalStep(frame, 15, 100, static_cast<uint8_t>(100 + rise));
    CountingHost host;
    RunEdgeMap(frame, host);
    const uint8_t expected = rise == 46 ? 0 : 255;
    for (int y = 1; y <= 26; ++y) {
      EXPECT_EQ(frame.MapAt(14, y), expected) << "rise " << rise;
      EXPECT_EQ(frame.MapAt(15, y), expected) << "rise " << rise;
      EXPECT_EQ(frame.MapAt(13, y), 255);
      EXPECT_EQ(frame.MapAt(16, y), 255);
    }
  }
}

TEST(EdgeMapTest, RgbUsesTheChannelSum) {
  for (int rise : {16, 15}) {
    TestFrame frame(30, 30, 3);
    VerticalStep(frame, 15, 100, static_cast<uint8_t>(100 + rise));
    CountingHost host;
    RunEdgeMap(frame, host);
    EXPECT_EQ(frame.MapAt(14, 10), rise == 16 ? 0 : 255) << "rise " << rise;
  }
}

TEST(EdgeMapTest, HorizontalStepAndDiagonalCorner) {
  TestFrame frame(30, 30, 1);
  frame.Fill(200);
  frame.FillRect(0, 12, 30, 30, 100);  // rows 12 on darker
  CountingHost host;
  RunEdgeMap(frame, host);
  EXPECT_EQ(frame.MapAt(10, 11), 0);
  EXPECT_EQ(frame.MapAt(10, 12), 0);
  EXPECT_EQ(frame.MapAt(10, 10), 255);
  EXPECT_EQ(frame.MapAt(10, 13), 255);
}

TEST(EdgeMapTest, TransparencyIsNotPartOfTheSum) {
  TestFrame frame(30, 30, 1, /*alpha=*/true);
  frame.View().filterCase = 4;
  for (int y = 0; y < 30; ++y) {
    for (int x = 15; x < 30; ++x) frame.Set(x, y, 1, 0);  // transparency steps by 255
  }
  CountingHost host;
  RunEdgeMap(frame, host);
  for (int y = 1; y <= 26; ++y) {
    for (int x = 1; x <= 24; ++x) ASSERT_EQ(frame.MapAt(x, y), 255);
  }
}

TEST(EdgeMapTest, OutputBufferAndOtherPlanesStayUnchanged) {
  Synth::PageRecipe recipe;
  recipe.width = 120;
  recipe.height = 90;
  recipe.photo = Synth::PhotoRecipe{60, 45, 60, 40, 7};
  TestFrame frame(Synth::GeneratePage(recipe));
  const std::vector<uint8_t> output = frame.Output().Storage();
  const std::vector<uint8_t> input = frame.Input().Storage();
  CountingHost host;
  RunEdgeMap(frame, host);
  EXPECT_EQ(frame.Output().Storage(), output);
  int written = 0;
  for (int y = 0; y < 90; ++y) {
    for (int x = 0; x < 120; ++x) {
      const uint8_t* before = &input[static_cast<size_t>((y * 120 + x) * 3)];
      const uint8_t* after = frame.Input().Pixel(x, y);
      EXPECT_EQ(after[1], before[1]);
      EXPECT_EQ(after[2], before[2]);
      written += after[0] == 0;
    }
  }
  EXPECT_GT(written, 200);  // the photo's outline
}

TEST(EdgeMapTest, SourceIsTheOutputBuffer) {
  TestFrame frame(30, 30, 1);
  VerticalStep(frame, 15, 100, 200);
  // The input holds no step: only a map read from the output can show one.
  for (int y = 0; y < 30; ++y) {
    for (int x = 0; x < 30; ++x) frame.Input().Pixel(x, y)[0] = 100;
  }
  CountingHost host;
  RunEdgeMap(frame, host);
  EXPECT_EQ(frame.MapAt(14, 5), 0);
}

TEST(EdgeMapTest, TooSmallExtentWritesNothing) {
  struct Case {
    int width, height;
    int steps;
  };
  // Height 4: Hu - 4 = 0 rows. Width 3: rows run but no column (Wu - 6 < 1).
  for (const Case& c : {Case{2, 30, 0}, Case{30, 2, 0}, Case{30, 4, 0}, Case{3, 30, 26},
                        Case{6, 30, 26}, Case{30, 5, 1}}) {
    TestFrame frame(c.width, c.height, 1);
    VerticalStep(frame, 1, 0, 255);
    MarkMap(frame);
    CountingHost host;
    EXPECT_EQ(RunEdgeMap(frame, host), c.steps) << c.width << " x " << c.height;
    for (int y = 0; y < c.height; ++y) {
      for (int x = 0; x < c.width; ++x) {
        const bool computed =
            c.width > 6 && x >= 1 && y >= 1 && y <= c.height - 4 && x <= c.width - 6;
        if (!computed) {
          ASSERT_EQ(frame.MapAt(x, y), 77) << c.width << " x " << c.height;
        }
      }
    }
  }
}

TEST(EdgeMapTest, SmallerOutputRectangleLimitsTheExtent) {
  TestFrame frame(40, 40, 1);
  frame.Fill(128);
  MarkMap(frame);
  frame.View().outRect = {0, 0, 20, 30};  // Hu = 20, Wu = 30
  CountingHost host;
  EXPECT_EQ(RunEdgeMap(frame, host), 16);
  EXPECT_EQ(frame.MapAt(24, 16), 255);
  EXPECT_EQ(frame.MapAt(25, 16), 77);
  EXPECT_EQ(frame.MapAt(24, 17), 77);
}

TEST(EdgeMapTest, CancelAtTheFirstRowWritesNothing) {
  TestFrame frame(30, 30, 1);
  MarkMap(frame);
  CountingHost host;
  host.cancelAtCall = 1;
  EXPECT_EQ(RunEdgeMap(frame, host), 0);
  EXPECT_EQ(host.resultCode, -128);
  EXPECT_EQ(host.progressCalls, 0);
  for (int y = 0; y < 30; ++y) {
    for (int x = 0; x < 30; ++x) ASSERT_EQ(frame.MapAt(x, y), 77);
  }
}

TEST(EdgeMapTest, CancelLaterKeepsTheRowsDone) {
  TestFrame frame(30, 30, 1);
  frame.Fill(128);
  MarkMap(frame);
  CountingHost host;
  host.cancelAtCall = 4;
  EXPECT_EQ(RunEdgeMap(frame, host), 3);
  EXPECT_EQ(frame.MapAt(5, 3), 255);
  EXPECT_EQ(frame.MapAt(5, 4), 77);
}

}  // namespace
