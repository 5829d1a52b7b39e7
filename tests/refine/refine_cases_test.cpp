// Each hard case of the page set, through the module's analysis, page
// preparation and refinement: found within a couple of pixels, with the
// page effect recognised for what it is.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <string>

#include "accuracy/memory_detector.h"
#include "accuracy/page_cases.h"
#include "accuracy/run.h"
#include "refine/pipeline.h"

namespace Accuracy {
namespace {

using Synth::HardKind;

struct Outcome {
  PageCase page;
  Synth::HardPageRecipe recipe;
  Refine::PipelineResult result;
  Score raw, refined;
};

Outcome RunKind(HardKind kind, uint32_t seed) {
  Outcome o;
  o.recipe = Synth::MakeHardPageRecipe(kind, seed, 1200, 900);
  o.page = GeneratedCase(o.recipe);
  MemoryDetector detector;
  o.result = Refine::DetectAndRefine(detector, o.page.page.View());
  o.raw = ScoreAnswer(o.page.truth, RawAnswerOf(o.result.raw));
  o.refined = ScoreAnswer(o.page.truth, RefinedAnswerOf(o.result.refined));
  return o;
}

bool Prepared(const Outcome& o, const std::string& kind) {
  return std::any_of(o.result.preparations.begin(), o.result.preparations.end(),
                     [&](const Refine::Preparation& p) { return p.kind == kind; });
}

// Every corner within `limit` px of the paper's true corner.
void ExpectFound(const Outcome& o, double limit = 2.0) {
  EXPECT_NE(o.result.refined.status, Refine::RefineStatus::kNoPhoto) << o.page.name;
  EXPECT_TRUE(o.refined.found) << o.page.name;
  EXPECT_LE(o.refined.maxCornerError, limit) << o.page.name << ": " << o.result.refined.reason;
}

std::string KindTestName(const ::testing::TestParamInfo<HardKind>& kind) {
  std::string name(Synth::HardKindName(kind.param));
  std::replace(name.begin(), name.end(), '-', '_');
  return name;
}

class EveryPhotoKind : public ::testing::TestWithParam<HardKind> {};

TEST_P(EveryPhotoKind, FoundWithinTwoPixels) {
  for (uint32_t seed = 1; seed <= 2; ++seed) {
    const Outcome o = RunKind(GetParam(), seed);
    ExpectFound(o);
    // The refined angle follows the paper, whatever the module's half-degree vote said.
    EXPECT_LT(o.refined.angleError, 0.1) << o.page.name;
  }
}

INSTANTIATE_TEST_SUITE_P(HardPages, EveryPhotoKind,
                         ::testing::Values(HardKind::kPlain, HardKind::kWhiteBorder,
                                           HardKind::kShadowBand, HardKind::kShadowRamp,
                                           HardKind::kSheared, HardKind::kBedStrip,
                                           HardKind::kGreyLid, HardKind::kUnevenLid,
                                           HardKind::kLowContrast, HardKind::kDarkPhoto,
                                           HardKind::kHeavyNoise, HardKind::kJpeg,
                                           HardKind::kOffPage, HardKind::kDust),
                         KindTestName);

TEST(RefineCases, ShadowBandIsLeftOutside) {
  // The module's corners sit on the band's outer side; the refined ones on the paper.
  const Outcome o = RunKind(HardKind::kShadowBand, 3);
  bool band = false;
  for (const auto& side : o.result.refined.sides) band = band || side.band;
  EXPECT_TRUE(band);
  EXPECT_GT(o.raw.maxCornerError, 4.0);
  ExpectFound(o, 1.5);
}

TEST(RefineCases, WhiteMarginGivesPaperAndPicture) {
  for (uint32_t seed = 1; seed <= 3; ++seed) {
    const Outcome o = RunKind(HardKind::kWhiteBorder, seed);
    ExpectFound(o);
    ASSERT_TRUE(o.result.refined.margin) << o.page.name;
    Synth::HardPage hard = Synth::GenerateHardPage(o.recipe);
    for (size_t k = 0; k < 4; ++k) {
      const Refine::Vec2 p = o.result.refined.picture[k];
      EXPECT_NEAR(p.x + 0.5, hard.picture[k][0], 2.0) << o.page.name << " corner " << k;
      EXPECT_NEAR(p.y + 0.5, hard.picture[k][1], 2.0) << o.page.name << " corner " << k;
    }
  }
}

TEST(RefineCases, SheetThatIsNotRectangularIsFollowed) {
  Synth::HardPageRecipe recipe = Synth::MakeHardPageRecipe(HardKind::kSheared, 4, 1200, 900);
  recipe.shearDegrees = 0.2;
  recipe.paperHeight = 700.0;
  recipe.centerY = 450.0;
  PageCase c = GeneratedCase(recipe);
  MemoryDetector detector;
  const auto result = Refine::DetectAndRefine(detector, c.page.View());
  const Score s = ScoreAnswer(c.truth, RefinedAnswerOf(result.refined));
  EXPECT_LE(s.maxCornerError, 1.0);
  // Left and right sides turn 0.2 degrees further than top and bottom.
  const auto& q = result.refined.outline;
  const double top = std::atan2(q[1].y - q[0].y, q[1].x - q[0].x);
  const double left = std::atan2(q[0].x - q[3].x, q[3].y - q[0].y);
  EXPECT_NEAR(std::abs((left - top) * 180.0 / 3.14159265358979), 0.2, 0.05);
}

TEST(RefineCases, BedStripIsLeftOutOfTheFilterRectangle) {
  const Outcome o = RunKind(HardKind::kBedStrip, 1);
  EXPECT_FALSE(o.raw.found);  // the module takes the strip for the photo
  EXPECT_TRUE(Prepared(o, "bed-strip"));
  ASSERT_TRUE(o.result.filterRect);
  ASSERT_TRUE(o.result.prepared);
  ExpectFound(o);
}

TEST(RefineCases, HeavyNoiseIsSmoothedForTheModule) {
  const Outcome o = RunKind(HardKind::kHeavyNoise, 1);
  EXPECT_TRUE(Prepared(o, "smooth-noise"));
  ExpectFound(o);
}

TEST(RefineCases, PaperOffThePageEndsAtThePageEdge) {
  const Outcome o = RunKind(HardKind::kOffPage, 2);
  const auto& sides = o.result.refined.sides;
  EXPECT_TRUE(std::any_of(sides.begin(), sides.end(), [](const Refine::SideResult& s) {
    return s.status == Refine::SideStatus::kPageEdge;
  }));
  ExpectFound(o);
}

TEST(RefineCases, BlankPagesReportNoPhoto) {
  for (uint32_t seed = 1; seed <= 4; ++seed) {
    const Outcome o = RunKind(HardKind::kBlank, seed);
    EXPECT_FALSE(o.refined.falseAlarm) << o.page.name << ": " << o.result.refined.reason;
    EXPECT_EQ(o.result.refined.status, Refine::RefineStatus::kNoPhoto) << o.page.name;
  }
}

}  // namespace
}  // namespace Accuracy
