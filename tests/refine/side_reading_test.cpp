// Reading a side's typical profile: which step is the paper's edge.
#include "refine/side_reading.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>

namespace Refine {
namespace {

constexpr double kNaN = std::numeric_limits<double>::quiet_NaN();

// s runs outward; level and roughness as functions of s.
AlignedProfile Profile(const std::function<double(double)>& level,
                       const std::function<double(double)>& rough, double from = -80.0,
                       double to = 80.0) {
  AlignedProfile p;
  p.sFrom = from;
  p.sStep = 1.0;
  p.lines = 100;
  p.noise = 1.0;
  p.tCentre = 300.0;
  for (double s = from; s <= to; s += 1.0) {
    p.mean.push_back(level(s));
    p.roughness.push_back(rough(s));
  }
  return p;
}

// A step from a to b across 1.5 px centred on at.
double Step(double s, double at, double a, double b) {
  return a + (b - a) * std::clamp((s - at) / 1.5 + 0.5, 0.0, 1.0);
}

// Textured picture inside `edge`, calm page outside.
std::function<double(double)> RoughInside(double edge) {
  return [edge](double s) { return s < edge ? 8.0 : 1.0; };
}

TEST(SideReading, PlainEdgeBetweenPictureAndLid) {
  const auto p = Profile([](double s) { return Step(s, 0.0, 100.0, 240.0); }, RoughInside(0.0));
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_NEAR(r.offset, 0.0, 0.6);
  EXPECT_EQ(r.polarity, 1);
  EXPECT_FALSE(r.band);
  EXPECT_FALSE(r.pageEdge);
  EXPECT_NEAR(r.contrast, 140.0, 1.0);
}

TEST(SideReading, TakesTheInnerSideOfAShadowBand) {
  const auto p = Profile(
      [](double s) { return s < -3.0 ? Step(s, -6.0, 170.0, 110.0) : Step(s, 0.0, 110.0, 240.0); },
      RoughInside(-6.0));
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_TRUE(r.band);
  EXPECT_NEAR(r.bandWidth, 6.0, 0.7);
  EXPECT_NEAR(r.offset, -6.0, 0.6);
  EXPECT_EQ(r.polarity, -1);  // the paper is brighter than its shadow
}

TEST(SideReading, ADarkPictureBehindABandIsStillFound) {
  const auto p = Profile(
      [](double s) { return s < -3.0 ? Step(s, -8.0, 40.0, 120.0) : Step(s, 0.0, 120.0, 240.0); },
      RoughInside(-8.0));
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_TRUE(r.band);
  EXPECT_NEAR(r.offset, -8.0, 0.6);
  EXPECT_EQ(r.polarity, 1);
}

TEST(SideReading, DustOnTheLidIsNotAnEdge) {
  // The paper's edge at -30; a shallow dip of dust at +10.
  const auto p = Profile(
      [](double s) {
        const double base = Step(s, -30.0, 90.0, 240.0);
        return std::abs(s - 10.0) <= 1.0 ? base - 4.0 : base;
      },
      RoughInside(-30.0));
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_NEAR(r.offset, -30.0, 0.6);
}

TEST(SideReading, ASoftRampLeadsToThePaperNotToItsWiggles) {
  // Picture inside -20, then a ramp rising from 130 toward the lid.
  const auto p = Profile(
      [](double s) {
        if (s < -20.0) return 120.0 + 2.0 * std::sin(s);
        const double e = s + 20.0;
        return 240.0 - 110.0 * std::exp(-e / 12.0) + 0.6 * std::sin(3.0 * s);
      },
      RoughInside(-20.0));
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_NEAR(r.offset, -20.0, 1.0);
}

TEST(SideReading, WhiteMarginInsideTheEdge) {
  const auto p = Profile(
      [](double s) {
        return s < -15.0 ? Step(s, -30.0, 100.0, 250.0) : Step(s, 0.0, 250.0, 236.0);
      },
      RoughInside(-30.0));
  ReadOptions options;
  options.maxMarginWidth = 50.0;
  const SideReading r = ReadSide(p, options);
  ASSERT_TRUE(r.found);
  EXPECT_NEAR(r.offset, 0.0, 0.6);
  EXPECT_EQ(r.polarity, -1);
  ASSERT_TRUE(r.margin);
  EXPECT_NEAR(r.innerOffset, -30.0, 0.6);
  EXPECT_EQ(r.innerPolarity, 1);
  // Without looking for margins the outer edge is still the paper's.
  const SideReading plain = ReadSide(p, {});
  EXPECT_FALSE(plain.margin);
  EXPECT_NEAR(plain.offset, 0.0, 0.6);
}

TEST(SideReading, MarginBehindAShadowBand) {
  const auto p = Profile(
      [](double s) {
        if (s < -18.0) return Step(s, -30.0, 100.0, 250.0);
        if (s < -3.0) return Step(s, -7.0, 250.0, 150.0);
        return Step(s, 0.0, 150.0, 240.0);
      },
      RoughInside(-30.0));
  ReadOptions options;
  options.maxMarginWidth = 50.0;
  const SideReading r = ReadSide(p, options);
  ASSERT_TRUE(r.found);
  EXPECT_TRUE(r.band);
  EXPECT_NEAR(r.offset, -7.0, 0.6);
  ASSERT_TRUE(r.margin);
  EXPECT_NEAR(r.innerOffset, -30.0, 0.6);
}

TEST(SideReading, PaperRunningOffThePage) {
  // Textured picture up to where the page ends at +20.
  auto p = Profile([](double s) { return 120.0 + 20.0 * std::sin(0.3 * s); },
                   [](double) { return 9.0; });
  for (size_t k = 0; k < p.mean.size(); ++k) {
    if (p.OffsetOf(static_cast<double>(k)) > 20.0) p.mean[k] = p.roughness[k] = kNaN;
  }
  // Values missing only because lines were lined up: the page goes on.
  EXPECT_FALSE(ReadSide(p, {}).pageEdge);
  p.areaEnds = true;
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_TRUE(r.pageEdge);
  EXPECT_NEAR(r.offset, 20.0, 0.01);
}

TEST(SideReading, BareLidHasNoEdge) {
  auto p = Profile([](double s) { return 240.0 + 0.5 * std::sin(s); }, [](double) { return 1.0; });
  EXPECT_FALSE(ReadSide(p, {}).found);
  // Nor is the bare lid the paper running off the page where the page ends.
  for (size_t k = 0; k < p.mean.size(); ++k) {
    if (p.OffsetOf(static_cast<double>(k)) > 20.0) p.mean[k] = p.roughness[k] = kNaN;
  }
  p.areaEnds = true;
  const SideReading r = ReadSide(p, {});
  EXPECT_FALSE(r.found);
  EXPECT_FALSE(r.pageEdge);
}

TEST(SideReading, APaleStretchOfPictureIsNotTheLid) {
  // Picture inside 0; a calm pale stretch outside that never reaches the lid.
  const auto p = Profile([](double s) { return Step(s, 0.0, 110.0, 224.0); }, RoughInside(0.0));
  ReadOptions options;
  options.expectedLid = 242.0;
  options.lidTolerance = 8.0;
  EXPECT_FALSE(ReadSide(p, options).found);
  options.expectedLid = 226.0;
  EXPECT_TRUE(ReadSide(p, options).found);
}

TEST(SideReading, AWideDarkStretchIsNotABand) {
  // 16 px of calm dark picture inside the edge, then texture: too wide for a shadow.
  const auto p = Profile(
      [](double s) { return s < -8.0 ? Step(s, -16.0, 170.0, 90.0) : Step(s, 0.0, 90.0, 240.0); },
      RoughInside(-16.0));
  const SideReading r = ReadSide(p, {});
  ASSERT_TRUE(r.found);
  EXPECT_FALSE(r.band);
  EXPECT_NEAR(r.offset, 0.0, 0.6);
}

}  // namespace
}  // namespace Refine
