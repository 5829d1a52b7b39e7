// Page preparation: bed strips found on every edge and nowhere else, the
// page's noise and lid measured, the prepared copy made only when needed.
#include "refine/page_prep.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "synth/hard_pages.h"

namespace Refine {
namespace {

PageImage ViewOf(const Synth::Page& page) {
  return {page.width,         page.height,
          page.channels,      page.channels,
          page.pixels.data(), static_cast<std::ptrdiff_t>(page.width) * page.channels};
}

TEST(PagePrep, FindsABedStripOnEachEdge) {
  for (int edge = 0; edge < 4; ++edge) {
    Synth::HardPageRecipe recipe =
        Synth::MakeHardPageRecipe(Synth::HardKind::kBedStrip, 7, 1000, 760);
    recipe.bedStripSide = edge;
    recipe.bedStripWidth = 33.0;
    const Synth::HardPage hard = Synth::GenerateHardPage(recipe);
    const PageSurvey survey = SurveyPage(ViewOf(hard.page));
    for (int e = 0; e < 4; ++e) {
      if (e == edge) {
        // The whole strip and its soft edge, and not much of the lid.
        EXPECT_GE(survey.bedStrip[static_cast<size_t>(e)], 34) << "edge " << e;
        EXPECT_LE(survey.bedStrip[static_cast<size_t>(e)], 40) << "edge " << e;
      } else {
        EXPECT_EQ(survey.bedStrip[static_cast<size_t>(e)], 0) << "edge " << e;
      }
    }
    const PreparedPage prepared = PreparePage(ViewOf(hard.page));
    ASSERT_TRUE(prepared.filterRect);
    ASSERT_EQ(prepared.steps.size(), 1u);
    EXPECT_EQ(prepared.steps[0].kind, "bed-strip");
    EXPECT_TRUE(prepared.pixels.empty());  // a filter rectangle needs no copy
    const FilterRect& r = *prepared.filterRect;
    const int cut = survey.bedStrip[static_cast<size_t>(edge)];
    const FilterRect expected{edge == 0 ? cut : 0, edge == 3 ? cut : 0, edge == 2 ? 760 - cut : 760,
                              edge == 1 ? 1000 - cut : 1000};
    EXPECT_EQ(r, expected);
  }
}

TEST(PagePrep, NoStripWhereThereIsNone) {
  // A photo over the page's edge, a lid shadow along the top, a dark photo: none is a bed strip.
  const Synth::HardKind kinds[] = {Synth::HardKind::kOffPage, Synth::HardKind::kUnevenLid,
                                   Synth::HardKind::kDarkPhoto, Synth::HardKind::kPlain};
  for (const auto kind : kinds) {
    for (uint32_t seed = 1; seed <= 3; ++seed) {
      const Synth::HardPage hard =
          Synth::GenerateHardPage(Synth::MakeHardPageRecipe(kind, seed, 900, 700));
      const PreparedPage prepared = PreparePage(ViewOf(hard.page));
      EXPECT_FALSE(prepared.filterRect) << Synth::HardKindName(kind) << " " << seed;
      EXPECT_TRUE(prepared.steps.empty()) << Synth::HardKindName(kind) << " " << seed;
      EXPECT_EQ(prepared.view.pixels, hard.page.pixels.data());
    }
  }
}

TEST(PagePrep, MeasuresNoiseAndSmoothsOnlyHeavyNoise) {
  Synth::HardPageRecipe recipe =
      Synth::MakeHardPageRecipe(Synth::HardKind::kHeavyNoise, 2, 900, 700);
  recipe.color = false;
  recipe.noise = 14.0;
  recipe.lidLevel = 200.0;  // clear of 255, where noise would be clipped
  const Synth::HardPage noisy = Synth::GenerateHardPage(recipe);
  const PageSurvey survey = SurveyPage(ViewOf(noisy.page));
  EXPECT_NEAR(survey.noise, 14.0, 3.0);
  PreparedPage prepared = PreparePage(ViewOf(noisy.page));
  ASSERT_EQ(prepared.steps.size(), 1u);
  EXPECT_EQ(prepared.steps[0].kind, "smooth-noise");
  ASSERT_FALSE(prepared.pixels.empty());
  EXPECT_EQ(prepared.view.pixels, prepared.pixels.data());
  // The copy is calmer, the page itself untouched.
  EXPECT_LT(SurveyPage(prepared.view).noise, 0.5 * survey.noise);
  EXPECT_EQ(noisy.page.pixels, Synth::GenerateHardPage(recipe).page.pixels);

  recipe.noise = 2.0;
  const Synth::HardPage quiet = Synth::GenerateHardPage(recipe);
  EXPECT_NEAR(SurveyPage(ViewOf(quiet.page)).noise, 2.0, 1.0);
  EXPECT_TRUE(PreparePage(ViewOf(quiet.page)).steps.empty());
}

TEST(PagePrep, ColourNoiseCountsThreeTimesAgainstTheModule) {
  // The same gray-level noise: harmless on a gray page, smoothed on a colour one.
  Synth::HardPageRecipe recipe = Synth::MakeHardPageRecipe(Synth::HardKind::kPlain, 4, 800, 600);
  recipe.noise = 7.0;
  recipe.color = false;
  EXPECT_TRUE(PreparePage(ViewOf(Synth::GenerateHardPage(recipe).page)).steps.empty());
  recipe.color = true;
  const PreparedPage colour = PreparePage(ViewOf(Synth::GenerateHardPage(recipe).page));
  ASSERT_EQ(colour.steps.size(), 1u);
  EXPECT_EQ(colour.steps[0].kind, "smooth-noise");
}

TEST(PagePrep, EstimatesTheLidAndLevelsADarkOne) {
  Synth::HardPageRecipe recipe = Synth::MakeHardPageRecipe(Synth::HardKind::kGreyLid, 3, 900, 700);
  recipe.lidLevel = 120.0;
  recipe.color = false;
  const Synth::HardPage hard = Synth::GenerateHardPage(recipe);
  const PageSurvey survey = SurveyPage(ViewOf(hard.page));
  EXPECT_NEAR(survey.lidLevel, 120.0, 4.0);
  EXPECT_LT(survey.lidSpread, 10.0);
  const PreparedPage prepared = PreparePage(ViewOf(hard.page));
  ASSERT_EQ(prepared.steps.size(), 1u);
  EXPECT_EQ(prepared.steps[0].kind, "level-lid");
  EXPECT_NEAR(SurveyPage(prepared.view).lidLevel, 245.0, 5.0);

  recipe.lidLevel = 200.0;  // grey, but bright enough for the module
  EXPECT_TRUE(PreparePage(ViewOf(Synth::GenerateHardPage(recipe).page)).steps.empty());
}

TEST(PagePrep, LevelsAStronglyUnevenLid) {
  Synth::HardPageRecipe recipe =
      Synth::MakeHardPageRecipe(Synth::HardKind::kUnevenLid, 5, 900, 700);
  recipe.lidUnevenness = 0.45;
  recipe.hingeShadow = 0.0;
  const Synth::HardPage hard = Synth::GenerateHardPage(recipe);
  const PageSurvey before = SurveyPage(ViewOf(hard.page));
  ASSERT_TRUE(NeedsLevelling(before.lidLevel, before.lidSpread));
  const PreparedPage prepared = PreparePage(ViewOf(hard.page));
  ASSERT_FALSE(prepared.steps.empty());
  EXPECT_EQ(prepared.steps.back().kind, "level-lid");
  EXPECT_LT(SurveyPage(prepared.view).lidSpread, 0.5 * before.lidSpread);
}

}  // namespace
}  // namespace Refine
