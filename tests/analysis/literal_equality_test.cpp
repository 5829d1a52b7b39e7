// The module's stages against their literal form on randomised frames and on
// the golden pages: the same bits in every list, the same bytes in both
// buffers, the same host calls in the same order, cancels and refused
// memory included. Every test runs twice: with the row kernels this
// processor picks, and with the portable ones forced. Every case prints its
// seed; FRINGE_EQUALITY_SEED=<seed> replays one case and
// FRINGE_EQUALITY_CASES=<n> runs more of them.
#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string>
#include <vector>

#include "filter/analysis/allocation.h"
#include "filter/analysis/angle.h"
#include "filter/analysis/box_fit.h"
#include "filter/analysis/driver.h"
#include "filter/analysis/edge_map.h"
#include "filter/analysis/edge_points.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/kernel_choice.h"
#include "filter/analysis/profiles.h"
#include "filter/analysis/reference/literal_stages.h"
#include "golden_pages.h"
#include "platform/cpu/cpu_features.h"
#include "random_frames.h"
#include "recording_host.h"

namespace {

using namespace Project;
using AnalysisTest::BuildFrame;
using AnalysisTest::CaseCount;
using AnalysisTest::CaseSeed;
using AnalysisTest::DrawFrameCase;
using AnalysisTest::FirstDifference;
using AnalysisTest::FrameCase;
using AnalysisTest::Random;
using AnalysisTest::RecordingHost;
using AnalysisTest::TestFrame;

// Restores the allocation switches however a case ends.
struct MemorySwitches {
  ~MemorySwitches() {
    UnlimitAnalysisAllocations();
    RefuseWorkspaces(false);
  }
};

// The kernel build under test: false for the one this processor picks, true
// for the portable one.
class LiteralEqualityTest : public ::testing::TestWithParam<bool> {
 protected:
  void SetUp() override { ForcePortableKernels(GetParam()); }
  void TearDown() override { ForcePortableKernels(false); }
};

INSTANTIATE_TEST_SUITE_P(Kernels, LiteralEqualityTest, ::testing::Values(false, true),
                         [](const ::testing::TestParamInfo<bool>& kernels) {
                           return kernels.param ? "Portable" : "Chosen";
                         });

// The chosen run above covers the AVX2 kernels only where they are chosen.
TEST(KernelChoiceTest, AvxKernelsRunWhereTheProcessorHasThem) {
  if (!Vireo::Platform::ProcessorHasAvx2()) {
    GTEST_SKIP() << "no AVX2 on this processor: only the portable kernels are held to the oracle";
  }
  EXPECT_TRUE(UseWideKernels());
  ForcePortableKernels(true);
  EXPECT_FALSE(UseWideKernels());
  ForcePortableKernels(false);
  EXPECT_TRUE(UseWideKernels());
}

// A cancel point: mostly none, else somewhere in the run's calls.
int32_t DrawCancel(Random& r, int32_t calls) {
  return r.Chance(70) ? 0 : r.Between(1, std::max(calls, 1));
}

// Lists compared entry by entry as bits, storage included.
std::string ListDifference(const DoubleList& a, const DoubleList& b, int32_t entries) {
  if (a.count != b.count) {
    return "count " + std::to_string(a.count) + " against " + std::to_string(b.count);
  }
  if ((a.data == nullptr) != (b.data == nullptr)) return "storage present in one list only";
  if (a.data == nullptr) return "";
  for (int32_t i = 0; i < entries; ++i) {
    if (std::bit_cast<uint64_t>(a.data[i]) != std::bit_cast<uint64_t>(b.data[i])) {
      return "entry " + std::to_string(i) + ": " + std::to_string(a.data[i]) + " against " +
             std::to_string(b.data[i]);
    }
  }
  return "";
}

// The first byte where two buffers differ, or -1.
int64_t FirstByteDifference(const std::vector<uint8_t>& a, const std::vector<uint8_t>& b) {
  if (a.size() != b.size()) return 0;
  const auto where = std::mismatch(a.begin(), a.end(), b.begin());
  return where.first == a.end() ? -1 : where.first - a.begin();
}

void FillList(DoubleList& list, int32_t count, Random& r) {
  ASSERT_TRUE(AllocList(list, count));
  for (int32_t i = 0; i < count; ++i) list.data[i] = r.Unit() * 1000.0;
}

TEST_P(LiteralEqualityTest, ProfilesOnRandomFrames) {
  const int32_t cases = CaseCount(150);
  for (int32_t i = 0; i < cases; ++i) {
    FrameCase c = DrawFrameCase(CaseSeed("profiles", i));
    Random r(c.seed);
    if (r.Chance(25)) {
      // Tall, narrow and dark: whole-number sums beyond what 16 bits hold.
      c.height = r.Between(258, 900);
      c.width = r.Between(1, 40);
      c.content = AnalysisTest::Content::kExtremes;
    }
    SCOPED_TRACE(c.Describe());
    MemorySwitches switches;
    const int32_t cancel = DrawCancel(r, 2 * c.height);
    RefuseWorkspaces(r.Chance(10));
    auto mine = BuildFrame(c);
    auto literal = BuildFrame(c);

    DoubleList columns[2];
    DoubleList rows[2];
    Random fill(c.seed + 1);
    FillList(columns[0], c.width, fill);
    FillList(rows[0], c.height, fill);
    Random same(c.seed + 1);
    FillList(columns[1], c.width, same);
    FillList(rows[1], c.height, same);

    RecordingHost hosts[2] = {RecordingHost(cancel), RecordingHost(cancel)};
    ProgressCounter progress[2] = {{7, 3}, {7, 3}};
    ComputeProfiles(mine->View(), hosts[0], columns[0], rows[0], progress[0]);
    Reference::ComputeProfiles(literal->View(), hosts[1], columns[1], rows[1], progress[1]);

    EXPECT_EQ(FirstDifference(hosts[0].Calls(), hosts[1].Calls()), "");
    EXPECT_EQ(ListDifference(columns[0], columns[1], c.width), "") << "columns";
    EXPECT_EQ(ListDifference(rows[0], rows[1], c.height), "") << "rows";
    EXPECT_EQ(progress[0].done, progress[1].done);
    EXPECT_EQ(FirstByteDifference(mine->Input().Storage(), literal->Input().Storage()), -1);
    if (::testing::Test::HasFailure()) return;
  }
}

TEST_P(LiteralEqualityTest, EdgeMapOnRandomFrames) {
  const int32_t cases = CaseCount(150);
  for (int32_t i = 0; i < cases; ++i) {
    const FrameCase c = DrawFrameCase(CaseSeed("edge map", i));
    SCOPED_TRACE(c.Describe());
    MemorySwitches switches;
    Random r(c.seed);
    const int32_t cancel = DrawCancel(r, c.height);
    RefuseWorkspaces(r.Chance(10));
    int32_t threshold = 60;
    if (r.Chance(30)) threshold = r.Between(-70, 200);
    auto mine = BuildFrame(c);
    auto literal = BuildFrame(c);
    // Output rectangles a little off the input's change the usable extent.
    if (r.Chance(25)) {
      Rect out = mine->View().inRect;
      out.right = static_cast<int16_t>(out.right - r.Between(0, 8));
      out.bottom = static_cast<int16_t>(out.bottom - r.Between(0, 8));
      out.left = static_cast<int16_t>(out.left + r.Between(-3, 3));
      mine->View().outRect = out;
      literal->View().outRect = out;
    }

    RecordingHost hosts[2] = {RecordingHost(cancel), RecordingHost(cancel)};
    ProgressCounter progress[2];
    BuildEdgeMap(mine->View(), hosts[0], threshold, progress[0]);
    Reference::BuildEdgeMap(literal->View(), hosts[1], threshold, progress[1]);

    EXPECT_EQ(FirstDifference(hosts[0].Calls(), hosts[1].Calls()), "");
    EXPECT_EQ(FirstByteDifference(mine->Input().Storage(), literal->Input().Storage()), -1)
        << "threshold " << threshold;
    EXPECT_EQ(FirstByteDifference(mine->Output().Storage(), literal->Output().Storage()), -1);
    if (::testing::Test::HasFailure()) return;
  }
}

// Plane 0 of the input as an edge map: written by the edge map stage, or
// left as the case painted it (near-limit and hostile bytes).
TEST_P(LiteralEqualityTest, EdgePointsOnRandomMaps) {
  const int32_t cases = CaseCount(200);
  for (int32_t i = 0; i < cases; ++i) {
    FrameCase c = DrawFrameCase(CaseSeed("edge points", i));
    Random r(c.seed);
    if (r.Chance(15)) {
      // Wide and low: rows longer than the chunks the row scans rule out at once.
      c.width = r.Between(500, 1500);
      c.height = r.Between(27, 60);
    }
    SCOPED_TRACE(c.Describe());
    MemorySwitches switches;
    const bool mapped = r.Chance(60);
    Rect search{9, 9, static_cast<int16_t>(c.height - 9), static_cast<int16_t>(c.width - 9)};
    if (r.Chance(40)) {
      search = {static_cast<int16_t>(r.Between(-5, c.height + 5)),
                static_cast<int16_t>(r.Between(-5, c.width + 5)),
                static_cast<int16_t>(r.Between(-5, c.height + 5)),
                static_cast<int16_t>(r.Between(-5, c.width + 5))};
    }
    const int32_t cancel = DrawCancel(r, 2 * (c.width + c.height));
    const int32_t allowed = r.Chance(10) ? r.Between(0, 2) : -1;
    RefuseWorkspaces(r.Chance(15));
    auto mine = BuildFrame(c);
    auto literal = BuildFrame(c);
    if (mapped) {
      RecordingHost quiet;
      ProgressCounter progress;
      BuildEdgeMap(mine->View(), quiet, 60, progress);
      Reference::BuildEdgeMap(literal->View(), quiet, 60, progress);
    }

    RecordingHost hosts[2] = {RecordingHost(cancel), RecordingHost(cancel)};
    ProgressCounter progress[2];
    DoubleList xs[2];
    DoubleList ys[2];
    LimitAnalysisAllocations(allowed);
    const bool found = FindEdgePoints(mine->View(), hosts[0], search, xs[0], ys[0], progress[0]);
    LimitAnalysisAllocations(allowed);
    const bool expected =
        Reference::FindEdgePoints(literal->View(), hosts[1], search, xs[1], ys[1], progress[1]);
    UnlimitAnalysisAllocations();

    EXPECT_EQ(found, expected);
    EXPECT_EQ(FirstDifference(hosts[0].Calls(), hosts[1].Calls()), "");
    EXPECT_EQ(ListDifference(xs[0], xs[1], xs[1].count), "") << "X list";
    EXPECT_EQ(ListDifference(ys[0], ys[1], ys[1].count), "") << "Y list";
    if (::testing::Test::HasFailure()) return;
  }
}

// Point lists as the edge search leaves them, as the box fit sees them after
// straightening, and hostile ones. `far` puts single points beyond a frame's
// reach (which makes the literal box fit's window sums very slow).
void DrawPoints(Random& r, DoubleList& xs, DoubleList& ys, bool far) {
  const int32_t n = r.Chance(10) ? r.Between(0, 8) : r.Between(6, 2500);
  const int32_t kind = r.Between(0, 5);
  const int32_t yCount = r.Chance(5) ? std::max(n + r.Between(-2, 2), 0) : n;
  AllocList(xs, std::max(n, yCount));
  AllocList(ys, std::max(n, yCount));
  xs.count = n;
  ys.count = yCount;
  const double angle = (r.Unit() - 0.5) * 1.6;
  const double side = r.Between(20, 3000);
  const int32_t farPoint = far ? r.Between(0, std::max(n - 1, 0)) : -1;
  for (int32_t k = 0; k < std::max(n, yCount); ++k) {
    double x = 0.0;
    double y = 0.0;
    switch (kind) {
      case 0: {  // the outline of a turned rectangle, side by side as the passes give it
        const double t = static_cast<double>(k % (n / 4 + 1)) / (n / 4 + 1) * side;
        const int32_t s = k * 4 / std::max(n, 1);
        const double u = s % 2 == 0 ? t : side * (s / 2);
        const double v = s % 2 == 0 ? side * (s / 2) : t;
        x = std::round(u * std::cos(angle) - v * std::sin(angle) + (k == farPoint ? 40000.0 : 0.0));
        y = std::round(u * std::sin(angle) + v * std::cos(angle));
        break;
      }
      case 1:  // whole numbers, some beyond a frame's reach
        x = r.Between(0, 3000);
        y = r.Between(-1500, 1500) + (k == farPoint ? 40000 : 0);
        break;
      case 2:  // fractions, as after straightening
        x = r.Unit() * side - side / 3;
        y = r.Unit() * side;
        break;
      case 3:  // few distinct places: ties, zero spreads, count edges
        x = r.Between(0, 3) * 17;
        y = r.Between(0, 2) * 23 + (r.Chance(50) ? -0.0 : 0.0);
        break;
      case 4:  // lines of points, with a stray non-finite value now and then
        x = r.Chance(50) ? 100.0 : 100.0 + r.Between(0, 400);
        y = r.Chance(50) ? 300.0 : 300.0 + r.Between(0, 300) * 0.5;
        if (r.Chance(1)) x = std::numeric_limits<double>::infinity();
        break;
      default:  // huge magnitudes on one axis
        x = (r.Unit() - 0.5) * 1e12;
        y = std::round((r.Unit() - 0.5) * 3000.0);
        break;
    }
    xs.data[k] = x;
    ys.data[k] = y;
  }
}

TEST_P(LiteralEqualityTest, AngleOnRandomPointLists) {
  const int32_t cases = CaseCount(300);
  for (int32_t i = 0; i < cases; ++i) {
    const uint64_t seed = CaseSeed("angle", i);
    SCOPED_TRACE("seed " + std::to_string(seed) +
                 " (replay: FRINGE_EQUALITY_SEED=" + std::to_string(seed) + ")");
    MemorySwitches switches;
    Random r(seed);
    DoubleList xs;
    DoubleList ys;
    DrawPoints(r, xs, ys, r.Chance(30));
    int32_t bins = 180;
    if (r.Chance(20)) bins = r.Between(-2, 400);
    const bool refuse = r.Chance(5);

    double angles[2] = {-777.25, -777.25};
    if (refuse) LimitAnalysisAllocations(0);
    const bool done = EstimateAngle(xs, ys, bins, angles[0]);
    if (refuse) LimitAnalysisAllocations(0);
    const bool expected = Reference::EstimateAngle(xs, ys, bins, angles[1]);
    EXPECT_EQ(done, expected);
    EXPECT_EQ(std::bit_cast<uint64_t>(angles[0]), std::bit_cast<uint64_t>(angles[1]))
        << angles[0] << " against " << angles[1];
    if (::testing::Test::HasFailure()) return;
  }
}

TEST_P(LiteralEqualityTest, BoxFitOnRandomPointLists) {
  const int32_t cases = CaseCount(300);
  for (int32_t i = 0; i < cases; ++i) {
    const uint64_t seed = CaseSeed("box fit", i);
    SCOPED_TRACE("seed " + std::to_string(seed) +
                 " (replay: FRINGE_EQUALITY_SEED=" + std::to_string(seed) + ")");
    MemorySwitches switches;
    Random r(seed);
    DoubleList xs;
    DoubleList ys;
    DrawPoints(r, xs, ys, false);
    if (r.Chance(50) && xs.count == ys.count && xs.count > 0) {
      StraightenPoints(xs, ys, (r.Unit() - 0.5) * 90.0, {r.Unit() * 500, r.Unit() * 500});
    }
    AnalysisParams params;
    params.minCount = r.Chance(50) ? r.Between(0, 200) : r.Between(0, 20);
    params.minSeparation = r.Between(0, 30);
    const int32_t allowed = r.Chance(10) ? r.Between(0, 7) : -1;

    BoxCorners boxes[2];
    for (BoxCorners& box : boxes) box.fill({-1.5, -2.5});
    LimitAnalysisAllocations(allowed);
    const bool fitted = FitBox(xs, ys, boxes[0], params);
    LimitAnalysisAllocations(allowed);
    const bool expected = Reference::FitBox(xs, ys, boxes[1], params);
    EXPECT_EQ(fitted, expected);
    for (int k = 0; k < 4; ++k) {
      EXPECT_EQ(std::bit_cast<uint64_t>(boxes[0][k].x), std::bit_cast<uint64_t>(boxes[1][k].x))
          << "corner " << k;
      EXPECT_EQ(std::bit_cast<uint64_t>(boxes[0][k].y), std::bit_cast<uint64_t>(boxes[1][k].y))
          << "corner " << k;
    }
    if (::testing::Test::HasFailure()) return;
  }
}

// Two whole runs, the module's and the literal one, on copies of one frame.
void ExpectSameRun(TestFrame& mine, TestFrame& literal, int32_t cancel, int32_t allowed,
                   bool refuseWorkspaces, const AnalysisResult& previous) {
  MemorySwitches switches;
  RecordingHost hosts[2] = {RecordingHost(cancel), RecordingHost(cancel)};
  AnalysisResult results[2] = {previous, previous};
  RefuseWorkspaces(refuseWorkspaces);
  LimitAnalysisAllocations(allowed);
  RunAnalysis(mine.View(), hosts[0], results[0]);
  RefuseWorkspaces(false);
  LimitAnalysisAllocations(allowed);
  RunAnalysisWith(Reference::LiteralStages(), literal.View(), hosts[1], results[1]);
  UnlimitAnalysisAllocations();

  EXPECT_EQ(FirstDifference(hosts[0].Calls(), hosts[1].Calls()), "");
  EXPECT_EQ(std::bit_cast<uint64_t>(results[0].angle), std::bit_cast<uint64_t>(results[1].angle));
  EXPECT_EQ(results[0].confidence, results[1].confidence);
  for (int k = 0; k < 4; ++k) {
    EXPECT_EQ(results[0].corners.corner[k].v, results[1].corners.corner[k].v) << "corner " << k;
    EXPECT_EQ(results[0].corners.corner[k].h, results[1].corners.corner[k].h) << "corner " << k;
  }
  EXPECT_EQ(FirstByteDifference(mine.Input().Storage(), literal.Input().Storage()), -1);
  EXPECT_EQ(FirstByteDifference(mine.Output().Storage(), literal.Output().Storage()), -1);
}

TEST_P(LiteralEqualityTest, WholeRunsOnRandomFrames) {
  const int32_t cases = CaseCount(120);
  for (int32_t i = 0; i < cases; ++i) {
    const FrameCase c = DrawFrameCase(CaseSeed("whole run", i), 220);
    SCOPED_TRACE(c.Describe());
    Random r(c.seed);
    const int32_t cancel = DrawCancel(r, 4 * (c.width + c.height));
    const int32_t allowed = r.Chance(10) ? r.Between(0, 13) : -1;
    const bool refuse = r.Chance(10);
    AnalysisResult previous;
    previous.angle = r.Unit() * 10.0;
    previous.confidence = 127;
    previous.corners.corner[2] = {static_cast<int16_t>(r.Between(-100, 100)), 7};
    auto mine = BuildFrame(c);
    auto literal = BuildFrame(c);
    // Now and then a frame placed inside a larger document.
    if (r.Chance(20)) {
      const auto top = static_cast<int16_t>(r.Between(0, 50));
      const auto left = static_cast<int16_t>(r.Between(0, 50));
      const auto rows = static_cast<int16_t>(top + c.height + r.Between(0, 9));
      const auto columns = static_cast<int16_t>(left + c.width + r.Between(0, 9));
      for (TestFrame* frame : {mine.get(), literal.get()}) {
        FrameView& v = frame->View();
        v.inRect = {top, left, static_cast<int16_t>(top + c.height),
                    static_cast<int16_t>(left + c.width)};
        v.outRect = v.inRect;
        v.documentRows = rows;
        v.documentColumns = columns;
      }
    }
    ExpectSameRun(*mine, *literal, cancel, allowed, refuse, previous);
    if (::testing::Test::HasFailure()) return;
  }
}

TEST_P(LiteralEqualityTest, WholeRunsOnGoldenPages) {
  for (const AnalysisTest::GoldenPage& golden : AnalysisTest::GoldenPages()) {
    SCOPED_TRACE(golden.name);
    const Synth::Page page = Synth::GeneratePage(golden.recipe);
    for (const AnalysisTest::Layout layout :
         {AnalysisTest::Layout{}, AnalysisTest::Layout{5, 1, true}}) {
      TestFrame mine(page, layout);
      TestFrame literal(page, layout);
      mine.View().filterCase = golden.filterCase;
      literal.View().filterCase = golden.filterCase;
      ExpectSameRun(mine, literal, 0, -1, false, AnalysisResult{});
    }
  }
}

}  // namespace
