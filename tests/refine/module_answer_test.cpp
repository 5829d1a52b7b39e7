// Through the real module: the raw answer the pipeline reports is exactly
// the one the module published, preparation and refinement notwithstanding.
#include <gtest/gtest.h>

#include <cstring>

#include "accuracy/module_detector.h"
#include "accuracy/page_cases.h"
#include "accuracy/run.h"
#include "refine/pipeline.h"
#include "standin/detect.h"

namespace Accuracy {
namespace {

Standin::Detection Direct(const PageBuffer& page) {
  auto module = Standin::Module::Load(FRINGE_TEST_MODULE, true);
  Standin::PageView view;
  view.width = page.width;
  view.height = page.height;
  view.channels = page.channels;
  view.pixels = page.pixels.data();
  view.rowBytes = static_cast<std::ptrdiff_t>(page.width) * page.channels;
  return Standin::Detect(*module, view);
}

TEST(ModuleAnswer, RawAnswerIsWhatTheModulePublished) {
  // A page the module gets wrong (a bed strip), one it gets right, and a blank one.
  const Synth::HardKind kinds[] = {Synth::HardKind::kBedStrip, Synth::HardKind::kShadowBand,
                                   Synth::HardKind::kBlank};
  for (const auto kind : kinds) {
    const PageCase c = GeneratedCase(Synth::MakeHardPageRecipe(kind, 2, 1000, 750));
    ModuleDetector detector(FRINGE_TEST_MODULE);
    const Refine::PipelineResult result = Refine::DetectAndRefine(detector, c.page.View());
    const Standin::Detection d = Direct(c.page);
    ASSERT_TRUE(d.error.empty()) << d.error;
    ASSERT_TRUE(d.recordPresent);
    for (size_t k = 0; k < 4; ++k) {
      EXPECT_EQ(result.raw.corners[k].y, d.record[2 * k]) << c.name;
      EXPECT_EQ(result.raw.corners[k].x, d.record[2 * k + 1]) << c.name;
    }
    EXPECT_EQ(result.raw.confidence, d.record[8]) << c.name;
    if (d.record[8] == 255) {
      // The same double, to the last bit.
      EXPECT_EQ(std::memcmp(&result.raw.angle, &d.angle, sizeof(double)), 0) << c.name;
      for (size_t k = 0; k < 4; ++k) {
        EXPECT_EQ(result.raw.corners[k].y, d.points[2 * k]);
        EXPECT_EQ(result.raw.corners[k].x, d.points[2 * k + 1]);
      }
    }
  }
}

TEST(ModuleAnswer, PreparedRunUsesThePagesCoordinates) {
  const PageCase c =
      GeneratedCase(Synth::MakeHardPageRecipe(Synth::HardKind::kBedStrip, 3, 1000, 750));
  ModuleDetector detector(FRINGE_TEST_MODULE);
  const Refine::PipelineResult result = Refine::DetectAndRefine(detector, c.page.View());
  ASSERT_TRUE(result.prepared);
  ASSERT_TRUE(result.filterRect);
  ASSERT_TRUE(result.prepared->FoundPhoto());
  // The prepared answer lies on the photo in page coordinates, inside the rectangle.
  const Score s = ScoreAnswer(c.truth, RawAnswerOf(*result.prepared));
  EXPECT_TRUE(s.found) << s.maxCornerError;
  for (const auto& corner : result.prepared->corners) {
    EXPECT_GE(corner.y, (*result.filterRect)[0]);
    EXPECT_GE(corner.x, (*result.filterRect)[1]);
    EXPECT_LT(corner.y, (*result.filterRect)[2]);
    EXPECT_LT(corner.x, (*result.filterRect)[3]);
  }
}

TEST(ModuleAnswer, MissingModuleFileIsNamed) {
  try {
    ModuleDetector detector("/nonexistent/Fringe.9zf");
    FAIL() << "loaded a module that does not exist";
  } catch (const std::exception& e) {
    EXPECT_NE(std::string(e.what()).find("/nonexistent/Fringe.9zf"), std::string::npos) << e.what();
  }
}

}  // namespace
}  // namespace Accuracy
