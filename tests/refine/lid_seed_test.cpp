// The starting outline taken from the region that departs from the lid, and
// the minimum-area rectangle under it.
#include "refine/lid_seed.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <numbers>
#include <vector>

namespace Refine {
namespace {

Vec2 Turned(Vec2 p, double degrees) {
  const double a = degrees * std::numbers::pi / 180.0;
  return {p.x * std::cos(a) - p.y * std::sin(a), p.x * std::sin(a) + p.y * std::cos(a)};
}

// Corners of a w x h rectangle about `centre`, turned on screen by `degrees`,
// clockwise from the top-left.
Quad TurnedRectangle(Vec2 centre, double w, double h, double degrees) {
  Quad q{Vec2{-w / 2, -h / 2}, Vec2{w / 2, -h / 2}, Vec2{w / 2, h / 2}, Vec2{-w / 2, h / 2}};
  for (Vec2& p : q) p = centre + Turned(p, degrees);
  return q;
}

void ExpectCornersNear(const Quad& got, const Quad& want, double limit) {
  for (size_t k = 0; k < 4; ++k) {
    EXPECT_NEAR(got[k].x, want[k].x, limit) << "corner " << k;
    EXPECT_NEAR(got[k].y, want[k].y, limit) << "corner " << k;
  }
}

TEST(MinimumAreaRectangle, RecoversATurnedRectangleFromItsPointsInCornerOrder) {
  for (const double degrees : {-30.0, -7.5, 0.0, 12.0, 44.0}) {
    const Quad truth = TurnedRectangle({300, 200}, 240, 120, degrees);
    std::vector<Vec2> points(truth.begin(), truth.end());
    // Points inside and on the sides change nothing.
    for (int k = 1; k < 10; ++k) {
      points.push_back(truth[0] + (truth[2] - truth[0]) * (k / 10.0));
      points.push_back(truth[1] + (truth[2] - truth[1]) * (k / 10.0));
    }
    const auto got = MinimumAreaRectangle(points);
    ASSERT_TRUE(got) << degrees;
    EXPECT_TRUE(IsConvexClockwise(*got)) << degrees;
    ExpectCornersNear(*got, truth, 1e-9);
  }
}

TEST(MinimumAreaRectangle, NothingForTooFewOrCollinearPoints) {
  EXPECT_FALSE(MinimumAreaRectangle({}));
  EXPECT_FALSE(MinimumAreaRectangle({Vec2{1, 1}, Vec2{2, 2}}));
  EXPECT_FALSE(MinimumAreaRectangle({Vec2{0, 0}, Vec2{1, 1}, Vec2{2, 2}, Vec2{3, 3}}));
}

// A gray page: an even lid with a faint noise, and optionally a turned photo
// only a little darker than the lid, with a lid-coloured patch inside it.
struct GrayPage {
  int width = 900, height = 700;
  std::vector<uint8_t> pixels;
  PageImage View() const { return {width, height, 1, 1, pixels.data(), width}; }
};

GrayPage Paint(const Quad* photo) {
  GrayPage page;
  page.pixels.resize(static_cast<size_t>(page.width) * static_cast<size_t>(page.height));
  for (int y = 0; y < page.height; ++y)
    for (int x = 0; x < page.width; ++x) {
      double v = 236.0 + ((x * 7 + y * 13) % 5) - 2.0;
      const Vec2 p{static_cast<double>(x), static_cast<double>(y)};
      bool inside = photo != nullptr;
      for (int k = 0; k < 4 && inside; ++k)
        inside = Cross((*photo)[(k + 1) % 4] - (*photo)[k], p - (*photo)[k]) > 0.0;
      const bool patch = std::hypot(x - 420.0, y - 330.0) < 40.0;
      if (inside && !patch) v = 214.0 + ((x * 3 + y * 5) % 7) - 3.0;
      page.pixels[static_cast<size_t>(y) * static_cast<size_t>(page.width) + x] =
          static_cast<uint8_t>(v);
    }
  return page;
}

SampleArea WholePage(const GrayPage& page) {
  return {0.0, 0.0, page.width - 1.0, page.height - 1.0};
}

TEST(SeedFromLid, OutlinesAFaintPhotoToWithinABlock) {
  const Quad truth = TurnedRectangle({430, 340}, 520, 360, -6.0);
  const GrayPage page = Paint(&truth);
  const LidEstimate lid = EstimateLid(page.View());
  const auto seed = SeedFromLid(page.View(), lid, WholePage(page));
  ASSERT_TRUE(seed);
  // Blocks are 3 px here; the rectangle around them lies within about two of the sides.
  ExpectCornersNear(seed->corners, truth, 5.0);
  EXPECT_NEAR(seed->angle, OutlineAngleDegrees(truth), 0.5);
  EXPECT_GT(seed->coverage, 0.9);
}

TEST(SeedFromLid, NothingOnABlankPageOrOutsideTheArea) {
  const GrayPage blank = Paint(nullptr);
  EXPECT_FALSE(SeedFromLid(blank.View(), EstimateLid(blank.View()), WholePage(blank)));

  const Quad truth = TurnedRectangle({430, 340}, 520, 360, 3.0);
  const GrayPage page = Paint(&truth);
  const LidEstimate lid = EstimateLid(page.View());
  // An area on bare lid, beside the photo.
  EXPECT_FALSE(SeedFromLid(page.View(), lid, SampleArea{0.0, 0.0, 120.0, 699.0}));
  // No lid measured: no seed.
  EXPECT_FALSE(SeedFromLid(page.View(), LidEstimate{}, WholePage(page)));
}

TEST(DepartsOutside, OnlyAnOutlineInsideALargerRegionHasPhotoJustOutside) {
  const Quad truth = TurnedRectangle({430, 340}, 520, 360, 4.0);
  const GrayPage page = Paint(&truth);
  const LidEstimate lid = EstimateLid(page.View());
  const SampleArea area = WholePage(page);
  EXPECT_FALSE(DepartsOutside(page.View(), lid, area, truth));
  // The photo's right two thirds: its left side has photo outside it.
  const Quad part{truth[0] + (truth[1] - truth[0]) * 0.33, truth[1], truth[2],
                  truth[3] + (truth[2] - truth[3]) * 0.33};
  EXPECT_TRUE(DepartsOutside(page.View(), lid, area, part));
  // Outside the sample area nothing is read, so nothing departs: an area
  // starting just left of the part's left side.
  const double left = std::min(part[0].x, part[3].x) - 2.0;
  EXPECT_FALSE(DepartsOutside(page.View(), lid, SampleArea{left, 0.0, 899.0, 699.0}, part));
  const GrayPage blank = Paint(nullptr);
  EXPECT_FALSE(DepartsOutside(blank.View(), EstimateLid(blank.View()), area, part));
}

}  // namespace
}  // namespace Refine
