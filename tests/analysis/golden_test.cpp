// Golden results for fixed synthetic pages: position class, edge point
// count, centre, the angle's exact bits and the published record. Each was
// checked once against an independent, literal reading of the stages; any
// change to a single bit of the analysis shows here.
#include <gtest/gtest.h>

#include <array>
#include <bit>
#include <cstdint>
#include <vector>

#include "filter/analysis/classification.h"
#include "filter/analysis/driver.h"
#include "filter/analysis/edge_map.h"
#include "filter/analysis/edge_points.h"
#include "filter/analysis/profiles.h"
#include "golden_pages.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::GoldenPage;
using AnalysisTest::GoldenPages;
using AnalysisTest::TestFrame;

// Expected values of GoldenPages(), in the same order.
struct Golden {
  PositionClass position;
  int32_t points;
  uint64_t centreX;  // bits of the column centroid
  uint64_t centreY;
  uint64_t angle;                                 // bits of the published angle
  std::array<std::array<int16_t, 2>, 4> corners;  // (v, h), clockwise from top-left
  int32_t progressSteps;
};

std::vector<Golden> Goldens() {
  return {
      {kInside,
       1092,
       0x4073074fdc0c1768ULL,
       0x406c1a862f5d2461ULL,
       0x4027411983143bd2ULL,
       {{{148, 157}, {94, 422}, {280, 460}, {334, 196}}},
       2935},
      {kTouching,
       1314,
       0x4073464d4d6f9182ULL,
       0x406accb6df395ebdULL,
       0xc03704cc6a86d67eULL,
       {{{99, 200}, {216, 476}, {400, 398}, {283, 122}}},
       3135},
      {kInside,
       848,
       0x4070304cb5627c53ULL,
       0x4068760ec011d059ULL,
       0x4013db6db6db6db7ULL,
       {{{119, 137}, {99, 367}, {259, 381}, {279, 151}}},
       2535},
      {kInside,
       868,
       0x407181c36fc34aa5ULL,
       0x406a08b62f096bbeULL,
       0x3f458791a9357cceULL,
       {{{110, 155}, {110, 404}, {289, 404}, {289, 155}}},
       2735},
  };
}

TEST(GoldenTest, StagesAndRecordOfFixedPages) {
  const std::vector<GoldenPage> pages = GoldenPages();
  const std::vector<Golden> goldens = Goldens();
  ASSERT_EQ(pages.size(), goldens.size());
  for (size_t i = 0; i < pages.size(); ++i) {
    const Golden& g = goldens[i];
    const char* const name = pages[i].name;
    const int16_t filterCase = pages[i].filterCase;
    const Synth::Page page = Synth::GeneratePage(pages[i].recipe);

    // The first half and the edge search, stage by stage.
    TestFrame traced(page);
    traced.View().filterCase = filterCase;
    CountingHost quiet;
    ProgressCounter progress;
    DoubleList columns;
    DoubleList rows;
    ASSERT_TRUE(AllocList(columns, page.width));
    ASSERT_TRUE(AllocList(rows, page.height));
    ComputeProfiles(traced.View(), quiet, columns, rows, progress);
    EXPECT_EQ(std::bit_cast<uint64_t>(ProfileCentroid(columns)), g.centreX) << name;
    EXPECT_EQ(std::bit_cast<uint64_t>(ProfileCentroid(rows)), g.centreY) << name;
    EXPECT_EQ(ClassifyPosition(columns, rows, 10.0), g.position) << name;
    BuildEdgeMap(traced.View(), quiet, 60, progress);
    DoubleList xs;
    DoubleList ys;
    const Rect search{9, 9, static_cast<int16_t>(page.height - 9),
                      static_cast<int16_t>(page.width - 9)};
    ASSERT_TRUE(FindEdgePoints(traced.View(), quiet, search, xs, ys, progress)) << name;
    EXPECT_EQ(xs.count, g.points) << name;

    // The whole run.
    TestFrame frame(page);
    frame.View().filterCase = filterCase;
    CountingHost host;
    AnalysisResult result;
    RunAnalysis(frame.View(), host, result);
    ASSERT_EQ(host.records.size(), 1U) << name;
    ASSERT_FALSE(host.records[0].empty) << name;
    EXPECT_EQ(host.records[0].confidence, 255) << name;
    EXPECT_EQ(std::bit_cast<uint64_t>(result.angle), g.angle) << name << ": angle " << result.angle;
    for (int k = 0; k < 4; ++k) {
      EXPECT_EQ(host.records[0].corners.corner[k].v, g.corners[k][0]) << name << " corner " << k;
      EXPECT_EQ(host.records[0].corners.corner[k].h, g.corners[k][1]) << name << " corner " << k;
    }
    EXPECT_EQ(host.progressCalls, g.progressSteps) << name;
  }
}

}  // namespace
