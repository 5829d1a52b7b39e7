// Darkness profiles and their centroids.
#include <gtest/gtest.h>

#include <vector>

#include "filter/analysis/double_list.h"
#include "filter/analysis/profiles.h"
#include "test_frame.h"

namespace {

using namespace Project;
using AnalysisTest::CountingHost;
using AnalysisTest::Layout;
using AnalysisTest::TestFrame;

struct Profiles {
  DoubleList columns;
  DoubleList rows;
  ProgressCounter progress{1000, 0};
};

Profiles RunProfiles(TestFrame& frame, CountingHost& host) {
  Profiles p;
  EXPECT_TRUE(AllocList(p.columns, frame.Width()));
  EXPECT_TRUE(AllocList(p.rows, frame.Height()));
  ComputeProfiles(frame.View(), host, p.columns, p.rows, p.progress);
  return p;
}

DoubleList ListOf(std::vector<double> values) {
  DoubleList list;
  AllocList(list, static_cast<int32_t>(values.size()));
  for (size_t i = 0; i < values.size(); ++i) list.data[i] = values[i];
  return list;
}

TEST(ProfilesTest, WhiteFrameIsAllZeroWithCentroidsInTheMiddle) {
  TestFrame frame(100, 80, 3);
  CountingHost host;
  Profiles p = RunProfiles(frame, host);
  for (int x = 0; x < 100; ++x) EXPECT_EQ(p.columns.data[x], 0.0);
  for (int y = 0; y < 80; ++y) EXPECT_EQ(p.rows.data[y], 0.0);
  EXPECT_EQ(ProfileCentroid(p.columns), 50.0);
  EXPECT_EQ(ProfileCentroid(p.rows), 40.0);
}

TEST(ProfilesTest, BlackFrameCountsFullPixels) {
  TestFrame frame(100, 80, 3);
  frame.Fill(0);
  CountingHost host;
  Profiles p = RunProfiles(frame, host);
  for (int y = 0; y < 80; ++y) EXPECT_EQ(p.rows.data[y], 100.0);
  for (int x = 0; x < 100; ++x) EXPECT_EQ(p.columns.data[x], 80.0);
  // One abort test per row and pass, one progress step per row of the row pass.
  EXPECT_EQ(host.abortCalls, 160);
  EXPECT_EQ(host.progressCalls, 80);
  EXPECT_EQ(p.progress.done, 80);
}

TEST(ProfilesTest, GrayFrameSample51GivesFourFifths) {
  TestFrame frame(60, 40, 1);
  frame.Fill(51);
  CountingHost host;
  Profiles p = RunProfiles(frame, host);
  for (int y = 0; y < 40; ++y) EXPECT_EQ(p.rows.data[y], 60 * 0.8) << y;
  for (int x = 0; x < 60; ++x) EXPECT_DOUBLE_EQ(p.columns.data[x], 40 * 0.8) << x;
}

TEST(ProfilesTest, ChannelsAreAveragedAndPlacedByRowAndColumn) {
  TestFrame frame(30, 30, 3);
  frame.Set(4, 7, 0, 0);    // one black channel of three: a third of a pixel
  frame.Set(4, 7, 2, 153);  // and 0.4 of a channel
  CountingHost host;
  Profiles p = RunProfiles(frame, host);
  const double expected = (255.0 + 102.0) / (3 * 255.0);
  EXPECT_EQ(p.rows.data[7], expected);
  EXPECT_EQ(p.columns.data[4], expected);
  EXPECT_EQ(p.rows.data[6], 0.0);
  EXPECT_EQ(p.columns.data[5], 0.0);
}

TEST(ProfilesTest, TransparencyWeighsOnlyInFilterCases4And5) {
  for (int16_t filterCase : {1, 2, 3, 4, 5, 6}) {
    TestFrame frame(30, 30, 3, /*alpha=*/true);
    frame.View().filterCase = filterCase;
    frame.SetGray(2, 3, 0);
    frame.Set(2, 3, 3, 0);  // fully transparent black pixel
    frame.SetGray(5, 6, 0);
    frame.Set(5, 6, 3, 255);  // opaque black pixel
    frame.SetGray(8, 9, 0);
    frame.Set(8, 9, 3, 51);  // a fifth opaque
    CountingHost host;
    Profiles p = RunProfiles(frame, host);
    const bool weighs = filterCase == 4 || filterCase == 5;
    EXPECT_EQ(p.rows.data[3], weighs ? 0.0 : 1.0) << "case " << filterCase;
    EXPECT_EQ(p.rows.data[6], 1.0) << "case " << filterCase;
    const double fifth = (255.0 * (51 / 255.0) * 3) / (3 * 255.0);
    EXPECT_EQ(p.rows.data[9], weighs ? fifth : 1.0) << "case " << filterCase;
  }
}

TEST(ProfilesTest, TransparencyWeightIsDividedBeforeTheProduct) {
  // (255 - s) x (a / 255.0): other groupings round differently for these.
  TestFrame frame(30, 30, 1, /*alpha=*/true);
  frame.View().filterCase = 4;
  frame.Set(3, 5, 0, 1);
  frame.Set(3, 5, 1, 33);
  CountingHost host;
  Profiles p = RunProfiles(frame, host);
  const double weighted = 254.0 * (33 / 255.0);
  ASSERT_NE(weighted, 254.0 * (33 * (1 / 255.0)));
  ASSERT_NE(weighted, 254.0 * 33 / 255.0);
  EXPECT_EQ(p.rows.data[5], weighted / 255.0);
  EXPECT_EQ(p.columns.data[3], weighted / 255.0);
}

TEST(ProfilesTest, LayoutDoesNotChangeAnyBit) {
  const Layout layouts[] = {{}, {13, 0, false}, {0, 2, false}, {7, 1, true}, {0, 0, true}};
  std::vector<double> reference;
  for (const Layout& layout : layouts) {
    Synth::PageRecipe recipe;
    recipe.width = 90;
    recipe.height = 70;
    recipe.alpha = true;
    recipe.pageAlpha = 120;
    recipe.photo = Synth::PhotoRecipe{45, 35, 40, 30, 10};
    TestFrame frame(Synth::GeneratePage(recipe), layout);
    frame.View().filterCase = 5;
    CountingHost host;
    Profiles p = RunProfiles(frame, host);
    std::vector<double> values(p.columns.data.get(), p.columns.data.get() + 90);
    values.insert(values.end(), p.rows.data.get(), p.rows.data.get() + 70);
    if (reference.empty()) {
      reference = values;
      continue;
    }
    ASSERT_EQ(values.size(), reference.size());
    for (size_t i = 0; i < values.size(); ++i) {
      ASSERT_EQ(values[i], reference[i]) << "entry " << i << ", row padding " << layout.rowPadding
                                         << ", bottom-up " << layout.bottomUp;
    }
  }
}

TEST(ProfilesTest, CancelInTheRowPassStopsBeforeClearingOrNormalising) {
  TestFrame frame(40, 30, 1);
  frame.Fill(0);
  CountingHost host;
  host.cancelAtCall = 6;  // rows 0 ... 4 done
  Profiles p;
  ASSERT_TRUE(AllocList(p.columns, 40));
  ASSERT_TRUE(AllocList(p.rows, 30));
  p.columns.data[3] = 17.0;  // stands for whatever the columns held
  ComputeProfiles(frame.View(), host, p.columns, p.rows, p.progress);
  EXPECT_EQ(host.resultCode, -128);
  EXPECT_EQ(host.progressCalls, 5);
  EXPECT_EQ(p.progress.done, 5);
  EXPECT_EQ(p.rows.data[4], 40 * 255.0);  // not normalised
  EXPECT_EQ(p.rows.data[5], 0.0);         // cleared at allocation
  EXPECT_EQ(p.columns.data[3], 17.0);     // not cleared by the stage
}

TEST(ProfilesTest, CancelInTheColumnPassLeavesRowsUnnormalised) {
  TestFrame frame(40, 30, 1);
  frame.Fill(0);
  CountingHost host;
  host.cancelAtCall = 31 + 2;  // all 30 rows, then two column-pass rows
  Profiles p = RunProfiles(frame, host);
  EXPECT_EQ(host.resultCode, -128);
  EXPECT_EQ(host.progressCalls, 30);
  EXPECT_EQ(p.rows.data[0], 40 * 255.0);
  EXPECT_EQ(p.columns.data[0], 2 * 255.0);
}

TEST(ProfileCentroidTest, MomentDecidesTheMiddle) {
  EXPECT_EQ(ProfileCentroid(ListOf({0, 0, 4})), 2.0);
  EXPECT_EQ(ProfileCentroid(ListOf({4, 0, 0})), 1.5);
  EXPECT_EQ(ProfileCentroid(ListOf({0, 0, 0, 0})), 2.0);
  EXPECT_EQ(ProfileCentroid(ListOf({1, 1, 2})), (1.0 + 4.0) / 4.0);
  EXPECT_EQ(ProfileCentroid(ListOf({9})), 0.5);
  EXPECT_EQ(ProfileCentroid(DoubleList{}), 0.0);
}

}  // namespace
