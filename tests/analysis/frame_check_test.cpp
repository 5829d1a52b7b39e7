// Hostile frames: every check turns the run into the failure record before
// a byte of the frame is read, and valid layouts pass untouched.
#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "filter/analysis/driver.h"
#include "filter/analysis/frame_check.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::Layout;
using AnalysisTest::TestFrame;

struct BadFrame {
  std::string name;
  FrameProblem problem;
  std::function<void(TestFrame&)> spoil;
};

std::vector<BadFrame> BadFrames() {
  return {
      {"mode 7", FrameProblem::kNoChannels, [](TestFrame& f) { f.View().imageMode = 7; }},
      {"mode 12", FrameProblem::kNoChannels, [](TestFrame& f) { f.View().imageMode = 12; }},
      {"null input", FrameProblem::kNoInputBuffer, [](TestFrame& f) { f.View().inData = nullptr; }},
      {"null output", FrameProblem::kNoOutputBuffer,
       [](TestFrame& f) { f.View().outData = nullptr; }},
      {"reversed", FrameProblem::kEmptyRectangle,
       [](TestFrame& f) {
         // 16-bit width -60000 wraps to 5536: passes the size test, then caught here.
         f.View().inRect.left = 30000;
         f.View().inRect.right = -30000;
         f.View().outRect = f.View().inRect;
       }},
      {"short rows", FrameProblem::kShortInputRows,
       [](TestFrame& f) { f.View().inRowBytes = f.Width() * f.View().inColumnBytes - 1; }},
      {"short bottom-up rows", FrameProblem::kShortInputRows,
       [](TestFrame& f) { f.View().inRowBytes = -(f.Width() * f.View().inColumnBytes - 1); }},
      {"zero row distance", FrameProblem::kShortInputRows,
       [](TestFrame& f) { f.View().inRowBytes = 0; }},
      {"narrow pixels", FrameProblem::kNarrowInputPixels,
       [](TestFrame& f) {
         f.View().inColumnBytes = 2;
         f.View().outColumnBytes = 2;
       }},
      {"negative column distance", FrameProblem::kNarrowInputPixels,
       [](TestFrame& f) {
         f.View().inColumnBytes = -3;
         f.View().outColumnBytes = -3;
       }},
      {"no room for transparency", FrameProblem::kNarrowInputPixels,
       [](TestFrame& f) { f.View().filterCase = 5; }},
      {"too few planes", FrameProblem::kTooFewPlanes, [](TestFrame& f) { f.View().planes = 2; }},
      {"no transparency plane", FrameProblem::kTooFewPlanes,
       [](TestFrame& f) {
         f.View().filterCase = 4;
         f.View().inColumnBytes = f.View().outColumnBytes = 4;
         f.View().inRowBytes = f.View().outRowBytes = 4 * f.Width();
       }},
      {"output column distance", FrameProblem::kOutputLayoutDiffers,
       [](TestFrame& f) { f.View().outColumnBytes = 4; }},
      {"output rectangle", FrameProblem::kOutputLayoutDiffers,
       [](TestFrame& f) { f.View().outRect.bottom = static_cast<int16_t>(f.Height() - 1); }},
      {"short output rows", FrameProblem::kShortOutputRows,
       [](TestFrame& f) { f.View().outRowBytes = 5; }},
      {"same buffer", FrameProblem::kBuffersOverlap,
       [](TestFrame& f) {
         f.View().outData = f.View().inData;
         f.View().outRowBytes = f.View().inRowBytes;
       }},
      {"overlapping rows", FrameProblem::kBuffersOverlap,
       [](TestFrame& f) {
         f.View().outData = f.View().inData + f.View().inRowBytes * (f.Height() - 1);
         f.View().outRowBytes = f.View().inRowBytes;
       }},
  };
}

TEST(FrameCheckTest, EachProblemIsNamed) {
  for (const BadFrame& bad : BadFrames()) {
    TestFrame frame(60, 50, 3);
    bad.spoil(frame);
    EXPECT_EQ(CheckFrame(frame.View()), bad.problem) << bad.name;
    EXPECT_STRNE(DescribeFrameProblem(bad.problem), DescribeFrameProblem(FrameProblem::kNone));
  }
}

TEST(FrameCheckTest, OversizedAndEmptyRectangles) {
  TestFrame frame(60, 50, 1);
  frame.View().inRect = {0, -20000, 50, 20000};  // 40000 wide
  EXPECT_EQ(CheckFrame(frame.View()), FrameProblem::kOversizedRectangle);
  frame.View().inRect = {0, 10, 50, 10};
  EXPECT_EQ(CheckFrame(frame.View()), FrameProblem::kEmptyRectangle);
  frame.View().inRect = {-32768, 0, 32767, 60};  // 65535 tall
  EXPECT_EQ(CheckFrame(frame.View()), FrameProblem::kOversizedRectangle);
}

TEST(FrameCheckTest, HostileFramesTakeTheFailureExitWithoutReadingOrWriting) {
  for (const BadFrame& bad : BadFrames()) {
    TestFrame frame(60, 50, 3);
    frame.FillRect(20, 15, 40, 35, 30);
    const std::vector<uint8_t> input = frame.Input().Storage();
    bad.spoil(frame);
    CountingHost host;
    AnalysisResult result;
    result.angle = 3.25;
    result.confidence = 127;
    result.corners.corner[2].h = 77;
    RunAnalysis(frame.View(), host, result);
    ASSERT_EQ(host.records.size(), 1U) << bad.name;
    EXPECT_TRUE(host.records[0].empty) << bad.name;
    EXPECT_EQ(host.progressCalls, 0) << bad.name;
    EXPECT_EQ(host.abortCalls, 0) << bad.name;
    EXPECT_EQ(frame.Input().Storage(), input) << bad.name;
    EXPECT_EQ(result.angle, 3.25) << bad.name;
    EXPECT_EQ(result.confidence, 127) << bad.name;
    EXPECT_EQ(result.corners.corner[2].h, 77) << bad.name;
  }
}

TEST(FrameCheckTest, ValidLayoutsPass) {
  const Layout layouts[] = {{}, {17, 0, false}, {0, 1, false}, {3, 2, true}};
  for (const Layout& layout : layouts) {
    for (bool alpha : {false, true}) {
      for (int channels : {1, 3}) {
        TestFrame frame(60, 50, channels, alpha, layout);
        if (alpha) frame.View().filterCase = 5;
        EXPECT_EQ(CheckFrame(frame.View()), FrameProblem::kNone)
            << "padding " << layout.rowPadding << ", alpha " << alpha;
      }
    }
  }
  // Planes beyond the pixel's needs and a frame away from the document origin are fine.
  TestFrame extra(60, 50, 3, true);
  extra.View().filterCase = 1;
  EXPECT_EQ(CheckFrame(extra.View()), FrameProblem::kNone);
  extra.View().inRect = {50, 30, 100, 90};
  extra.View().outRect = extra.View().inRect;
  EXPECT_EQ(CheckFrame(extra.View()), FrameProblem::kNone);
}

}  // namespace
