// RunAnalysis: sizes, progress accounting, the paths of its outcome table,
// cancels, refused allocations and host errors.
#include <gtest/gtest.h>

#include <cmath>
#include <cstring>
#include <vector>

#include "filter/analysis/allocation.h"
#include "filter/analysis/driver.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::HostWriteError;
using AnalysisTest::Layout;
using AnalysisTest::TestFrame;

// A result as a previous run could have left it.
AnalysisResult Previous() {
  AnalysisResult r;
  for (int k = 0; k < 4; ++k) {
    r.corners.corner[k].v = static_cast<int16_t>(100 + k);
    r.corners.corner[k].h = static_cast<int16_t>(200 + k);
  }
  r.angle = 12.75;
  r.confidence = 127;
  return r;
}

bool SameCorners(const CornerQuad& a, const CornerQuad& b) {
  return std::memcmp(&a, &b, sizeof a) == 0;
}

CornerQuad Quad(int16_t left, int16_t top, int16_t right, int16_t bottom) {
  CornerQuad q;
  q.corner[0] = {top, left};
  q.corner[1] = {top, right};
  q.corner[2] = {bottom, right};
  q.corner[3] = {bottom, left};
  return q;
}

// A dark upright rectangle on a light frame: class 4 (inside).
void DrawInside(TestFrame& frame) {
  frame.Fill(230);
  frame.FillRect(frame.Width() / 4, frame.Height() / 4, frame.Width() * 3 / 4,
                 frame.Height() * 3 / 4, 40);
}

Synth::Page PhotoPage(int width, int height, double angle, bool color = true) {
  Synth::PageRecipe recipe;
  recipe.width = width;
  recipe.height = height;
  recipe.color = color;
  recipe.photo = Synth::PhotoRecipe{width * 0.5, height * 0.45, width * 0.45, height * 0.4, angle};
  return Synth::GeneratePage(recipe);
}

TEST(DriverTest, ParametersFollowTheSmallerSide) {
  EXPECT_EQ(MakeAnalysisParams(1000, 800).minCount, 120);
  EXPECT_EQ(MakeAnalysisParams(800, 1000).minCount, 120);
  EXPECT_EQ(MakeAnalysisParams(27, 27).minCount, 4);
  EXPECT_EQ(MakeAnalysisParams(2000, 1500).edgeThreshold, 60);
  EXPECT_EQ(MakeAnalysisParams(2000, 1500).minSeparation, 10);
  EXPECT_EQ(MakeAnalysisParams(2000, 1500).flatnessThreshold, 10.0);
}

TEST(DriverTest, FramesBelow27PixelsFailBeforeAnyStep) {
  for (auto [w, h] : {std::pair{26, 200}, std::pair{200, 26}}) {
    TestFrame frame(w, h, 1);
    CountingHost host;
    AnalysisResult result = Previous();
    RunAnalysis(frame.View(), host, result);
    ASSERT_EQ(host.records.size(), 1U);
    EXPECT_TRUE(host.records[0].empty);
    EXPECT_EQ(host.progressCalls, 0);
    EXPECT_TRUE(SameCorners(result.corners, Previous().corners));
  }
}

TEST(DriverTest, SmallestFrameIsAnalysed) {
  TestFrame frame(27, 27, 1);
  frame.Fill(230);
  frame.FillRect(0, 0, 14, 27, 20);  // dark left half: undecided, edges at 13 and 14
  CountingHost host;
  AnalysisResult result = Previous();
  RunAnalysis(frame.View(), host, result);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_FALSE(host.records[0].empty);
  EXPECT_EQ(host.records[0].confidence, 255);
  EXPECT_EQ(host.lastTotal, 2 * (27 + 2 * 27) - 33);
  EXPECT_TRUE(host.progressInOrder);
}

TEST(DriverTest, ProgressTotalAndStepsOfACompleteRun) {
  TestFrame frame(1000, 800, 1);
  DrawInside(frame);
  CountingHost host;
  AnalysisResult result;
  RunAnalysis(frame.View(), host, result);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_EQ(host.records[0].confidence, 255);
  EXPECT_EQ(host.lastTotal, 5167);
  EXPECT_EQ(host.progressCalls, 2 * 1000 + 4 * 800 - 65);
  EXPECT_EQ(host.lastDone, host.lastTotal - 32);
  EXPECT_TRUE(host.progressInOrder);
  // The dark rectangle 250 ... 749 x 200 ... 599, its outline pulled in by one.
  EXPECT_TRUE(SameCorners(host.records[0].corners, Quad(250, 200, 749, 599)))
      << host.records[0].corners.corner[0].h << "," << host.records[0].corners.corner[0].v;
  EXPECT_TRUE(SameCorners(result.corners, host.records[0].corners));
  EXPECT_EQ(result.angle, 0.0);
  EXPECT_TRUE(std::signbit(result.angle));
}

TEST(DriverTest, FlatPageWritesTheWholeImageAndKeepsTheAngle) {
  TestFrame frame(120, 90, 3);
  frame.Fill(228);
  frame.View().documentRows = 400;
  frame.View().documentColumns = 500;
  frame.View().inRect = {50, 30, 140, 150};
  frame.View().outRect = frame.View().inRect;
  CountingHost host;
  AnalysisResult result = Previous();
  RunAnalysis(frame.View(), host, result);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_FALSE(host.records[0].empty);
  EXPECT_EQ(host.records[0].confidence, 0);
  // The image rectangle's corners, shifted by the frame's left and top.
  EXPECT_TRUE(SameCorners(host.records[0].corners, Quad(30, 50, 529, 449)));
  EXPECT_EQ(result.confidence, 0);
  EXPECT_EQ(result.angle, 12.75);
  EXPECT_EQ(host.progressCalls, 2 * 90 + 3);
}

TEST(DriverTest, FullClassWithAFoundOutlinePublishes255) {
  // Dark everywhere but a light inner rectangle: the dark run reaches every
  // border, and the inner rectangle's outline is found.
  TestFrame frame(200, 150, 3);
  frame.Fill(40);
  frame.FillRect(60, 40, 140, 110, 210);
  CountingHost host;
  AnalysisResult result;
  RunAnalysis(frame.View(), host, result);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_EQ(host.records[0].confidence, 255);
  EXPECT_EQ(result.confidence, 255);
}

TEST(DriverTest, FullClassWithoutAnOutlineKeepsTheWholeImageAt127) {
  // Darker toward every border (a gentle ramp, far below the edge limit) and
  // a dark band around the frame whose edge lies outside the search
  // rectangle: the dark run reaches all borders, but nothing is found.
  TestFrame frame(200, 150, 3);
  for (int y = 0; y < 150; ++y) {
    for (int x = 0; x < 200; ++x) {
      const double u = std::abs(x - 99.5) / 99.5 + std::abs(y - 74.5) / 74.5;
      frame.SetGray(x, y, static_cast<uint8_t>(210.0 - 60.0 * u));
    }
  }
  frame.FillRect(0, 0, 200, 8, 30);      // edges on rows 7 and 8, above row 9
  frame.FillRect(0, 143, 200, 150, 30);  // edges on rows 142 and 143, below row 141
  frame.FillRect(0, 0, 8, 150, 30);
  frame.FillRect(193, 0, 200, 150, 30);
  CountingHost host;
  AnalysisResult result = Previous();
  RunAnalysis(frame.View(), host, result);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_TRUE(host.records[0].empty);
  EXPECT_EQ(result.confidence, 127);
  EXPECT_TRUE(SameCorners(result.corners, Quad(0, 0, 199, 149)));  // not offset or snapped
  EXPECT_EQ(result.angle, 12.75);
}

TEST(DriverTest, FilterRectangleOffsetMovesEveryCorner) {
  const Synth::Page page = PhotoPage(300, 220, 8.0);
  TestFrame atOrigin(page);
  TestFrame shifted(page);
  for (TestFrame* f : {&atOrigin, &shifted}) {
    f->View().documentRows = 400;
    f->View().documentColumns = 500;
  }
  shifted.View().inRect = {50, 30, 270, 330};
  shifted.View().outRect = shifted.View().inRect;
  CountingHost a;
  CountingHost b;
  AnalysisResult ra;
  AnalysisResult rb;
  RunAnalysis(atOrigin.View(), a, ra);
  RunAnalysis(shifted.View(), b, rb);
  ASSERT_EQ(a.records.size(), 1U);
  ASSERT_EQ(b.records.size(), 1U);
  ASSERT_EQ(a.records[0].confidence, 255);
  for (int k = 0; k < 4; ++k) {
    EXPECT_EQ(b.records[0].corners.corner[k].h, a.records[0].corners.corner[k].h + 30);
    EXPECT_EQ(b.records[0].corners.corner[k].v, a.records[0].corners.corner[k].v + 50);
  }
  EXPECT_EQ(std::memcmp(&ra.angle, &rb.angle, sizeof(double)), 0);
}

TEST(DriverTest, BufferLayoutDoesNotChangeTheResult) {
  const Synth::Page page = PhotoPage(320, 240, -13.0);
  AnalysisResult reference;
  bool first = true;
  for (const Layout& layout :
       {Layout{}, Layout{11, 0, false}, Layout{0, 1, true}, Layout{5, 2, true}}) {
    TestFrame frame(page, layout);
    CountingHost host;
    AnalysisResult result;
    RunAnalysis(frame.View(), host, result);
    ASSERT_EQ(host.records.size(), 1U);
    ASSERT_EQ(result.confidence, 255);
    if (first) {
      reference = result;
      first = false;
      continue;
    }
    EXPECT_TRUE(SameCorners(result.corners, reference.corners));
    EXPECT_EQ(std::memcmp(&result.angle, &reference.angle, sizeof(double)), 0);
  }
}

TEST(DriverTest, TransparentPageAroundAnOpaquePhotoInFilterCases4And5) {
  Synth::PageRecipe recipe;
  recipe.width = 400;
  recipe.height = 300;
  recipe.alpha = true;
  recipe.pageAlpha = 0;
  recipe.photo = Synth::PhotoRecipe{210, 140, 180, 120, -9.0};
  const Synth::Page page = Synth::GeneratePage(recipe);
  for (int16_t filterCase : {4, 5}) {
    TestFrame frame(page);
    frame.View().filterCase = filterCase;
    CountingHost host;
    AnalysisResult result;
    RunAnalysis(frame.View(), host, result);
    ASSERT_EQ(result.confidence, 255);
    EXPECT_NEAR(result.angle, -9.0, 0.5);
    for (int k = 0; k < 4; ++k) {
      EXPECT_NEAR(result.corners.corner[k].h, page.corners[k][0], 5.0);
      EXPECT_NEAR(result.corners.corner[k].v, page.corners[k][1], 5.0);
    }
  }
}

TEST(DriverTest, CancelInTheProfilesCarriesOnToTheFlatRecord) {
  TestFrame frame(100, 80, 3);
  DrawInside(frame);
  CountingHost host;
  host.cancelAtCall = 1;
  AnalysisResult result = Previous();
  RunAnalysis(frame.View(), host, result);
  EXPECT_EQ(host.resultCode, -128);
  // Cleared profiles grade as flat: the whole image with confidence 0.
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_FALSE(host.records[0].empty);
  EXPECT_EQ(host.records[0].confidence, 0);
  EXPECT_TRUE(SameCorners(host.records[0].corners, Quad(0, 0, 99, 79)));
  EXPECT_EQ(host.progressCalls, 7);  // the driver's own steps only
  EXPECT_EQ(result.angle, 12.75);
}

TEST(DriverTest, CancelInTheEdgeMapEndsInTheEdgeSearch) {
  TestFrame frame(100, 80, 3);
  DrawInside(frame);
  CountingHost host;
  host.cancelAtCall = 2 * 80 + 11;  // the edge map's eleventh row
  AnalysisResult result = Previous();
  RunAnalysis(frame.View(), host, result);
  EXPECT_EQ(host.resultCode, -128);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_TRUE(host.records[0].empty);
  EXPECT_EQ(host.progressCalls, 3 + 80 + 1 + 1 + 10 + 1);
  EXPECT_EQ(result.angle, 12.75);  // the edge search failed: angle untouched
}

TEST(DriverTest, CancelInTheEdgeSearchTakesTheFailureExit) {
  TestFrame frame(100, 80, 3);
  DrawInside(frame);
  CountingHost host;
  host.cancelAtCall = 2 * 80 + 76 + 30;  // the edge search's 30th line
  AnalysisResult result = Previous();
  RunAnalysis(frame.View(), host, result);
  EXPECT_EQ(host.resultCode, -128);
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_TRUE(host.records[0].empty);
  EXPECT_EQ(host.progressCalls, 3 + 80 + 1 + 1 + 76 + 1 + 29);
  EXPECT_TRUE(SameCorners(result.corners, Previous().corners));
}

TEST(DriverTest, EveryRefusedAllocationEndsInTheFailureRecord) {
  TestFrame frame(100, 80, 3);
  DrawInside(frame);
  // Two profiles, two point lists, the histogram, eight box-fit arrays.
  constexpr int32_t kAllocations = 13;
  for (int32_t allowed = 0; allowed <= kAllocations; ++allowed) {
    TestFrame copy(100, 80, 3);
    DrawInside(copy);
    CountingHost host;
    AnalysisResult result = Previous();
    LimitAnalysisAllocations(allowed);
    RunAnalysis(copy.View(), host, result);
    UnlimitAnalysisAllocations();
    ASSERT_EQ(host.records.size(), 1U) << allowed;
    EXPECT_EQ(host.records[0].empty, allowed < kAllocations) << allowed;
    if (allowed < 2) {
      EXPECT_EQ(host.progressCalls, 2);  // image and search rectangles only
      EXPECT_EQ(result.angle, 12.75);
    }
    if (allowed >= 2 && allowed < kAllocations) {
      // Class 4: the corners stay as they were when the second half fails.
      EXPECT_TRUE(SameCorners(result.corners, Previous().corners)) << allowed;
      EXPECT_EQ(result.confidence, 127) << allowed;
    }
  }
}

TEST(DriverTest, HostErrorsFromTheRecordWritersPassThrough) {
  for (bool failurePath : {false, true}) {
    TestFrame frame(100, 80, 3);
    DrawInside(frame);
    CountingHost host;
    host.throwOnWrite = true;
    AnalysisResult result;
    if (failurePath) LimitAnalysisAllocations(4);  // the histogram is refused
    EXPECT_THROW(RunAnalysis(frame.View(), host, result), HostWriteError);
    UnlimitAnalysisAllocations();
    // Nothing leaks (the sanitizer build checks) and no step follows the write.
    EXPECT_EQ(host.progressCalls,
              failurePath ? 3 + 80 + 3 + 76 + 2 * (83 + 63) : 2 * 100 + 4 * 80 - 65 - 1);
  }
}

// Host callbacks that throw part-way: everything the run holds is released.
class ThrowingHost : public CountingHost {
 public:
  int32_t throwAtProgress = 0;
  void ReportProgress(int32_t done, int32_t total) override {
    CountingHost::ReportProgress(done, total);
    if (progressCalls == throwAtProgress) throw HostWriteError();
  }
};

TEST(DriverTest, HostErrorsFromProgressReleaseEverything) {
  for (int32_t at : {3, 4, 50, 83, 85, 100, 200, 300}) {
    TestFrame frame(100, 80, 3);
    DrawInside(frame);
    ThrowingHost host;
    host.throwAtProgress = at;
    AnalysisResult result;
    EXPECT_THROW(RunAnalysis(frame.View(), host, result), HostWriteError) << at;
    EXPECT_TRUE(host.records.empty());
  }
}

TEST(DriverTest, SecondHalfFailureOfAnUndecidedPageKeepsTheWholeImage) {
  TestFrame frame(27, 27, 1);
  frame.Fill(230);
  frame.FillRect(0, 0, 14, 27, 20);
  CountingHost host;
  AnalysisResult result = Previous();
  LimitAnalysisAllocations(4);  // profiles and point lists only
  RunAnalysis(frame.View(), host, result);
  UnlimitAnalysisAllocations();
  ASSERT_EQ(host.records.size(), 1U);
  EXPECT_TRUE(host.records[0].empty);
  EXPECT_EQ(result.confidence, 0);
  EXPECT_TRUE(SameCorners(result.corners, Quad(0, 0, 26, 26)));
  EXPECT_EQ(result.angle, 12.75);  // the histogram was refused: angle untouched
}

}  // namespace
