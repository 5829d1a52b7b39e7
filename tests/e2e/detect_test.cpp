// Detect, the convenience the command-line tool uses, over the built module:
// the same answer as a whole run of the host, for every kind of page it takes.
#include "standin/detect.h"
#include "e2e_support.h"

namespace {

using DetectModule = E2E::ModuleTest;

Standin::PageView View(const Synth::Page& page, const Synth::PageRecipe& recipe) {
  return {page.width,           page.height,
          recipe.color ? 3 : 1, recipe.alpha,
          page.pixels.data(),   static_cast<std::ptrdiff_t>(page.width) * page.channels};
}

TEST_F(DetectModule, AnswersLikeAWholeRunOfTheHost) {
  for (bool color : {true, false}) {
    for (bool alpha : {false, true}) {
      Synth::PageRecipe recipe = E2E::PhotoPage(640, 480, color ? -14.0 : 21.0, 31);
      recipe.color = color;
      recipe.alpha = alpha;
      Synth::Page page = Synth::GeneratePage(recipe);
      Standin::Detection detection = Standin::Detect(*module_, View(page, recipe));
      EXPECT_EQ(detection.error, "");
      ASSERT_TRUE(detection.recordPresent);
      ASSERT_TRUE(detection.descriptorPresent);

      auto host = MakeHost(E2E::PageDocument(recipe));
      host->Run();
      ASSERT_EQ(E2E::RecordValues(*host).size(), 1u);
      EXPECT_EQ(detection.record, E2E::RecordValues(*host)[0]);
      EXPECT_EQ(detection.angle, *host->LastDescriptor()->Float(0x616E676C));
      EXPECT_EQ(detection.confidence, 255);
      for (size_t i = 0; i < 8; ++i) EXPECT_EQ(detection.points[i], detection.record[i]) << i;
    }
  }
}

TEST_F(DetectModule, FilterRectangleMovesTheCornersIntoPageCoordinates) {
  Synth::PageRecipe recipe = E2E::PhotoPage(700, 500, 5.0, 32);
  Synth::Page page = Synth::GeneratePage(recipe);
  Standin::Detection whole = Standin::Detect(*module_, View(page, recipe));
  Standin::Detection part = Standin::Detect(
      *module_, View(page, recipe), {.filterRect = std::array<int32_t, 4>{20, 40, 490, 690}});
  EXPECT_EQ(part.error, "");
  EXPECT_EQ(part.confidence, 255);
  for (size_t i = 0; i < 8; ++i) {
    // The photo is the same; its corners are found within a pixel or two.
    EXPECT_NEAR(part.record[i], whole.record[i], 2) << i;
  }
}

TEST_F(DetectModule, PagesTheHostCannotTakeAreRefusedBeforeAnyRun) {
  std::vector<uint8_t> row(40000, 255);
  Standin::Detection detection = Standin::Detect(*module_, {40000, 1, 1, false, row.data(), 40000});
  EXPECT_NE(detection.error.find("at most 32767"), std::string::npos) << detection.error;
  EXPECT_EQ(detection.selectorResults, (std::array<int16_t, 6>{}));
  EXPECT_FALSE(detection.recordPresent);
}

}  // namespace
