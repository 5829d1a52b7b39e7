// Rounding the fitted corners and snapping sides onto the image border.
#include <gtest/gtest.h>

#include "filter/analysis/corner_snap.h"
#include "filter/analysis/geometry.h"

namespace {

using namespace Project;

CornerQuad Quad(int16_t left, int16_t top, int16_t right, int16_t bottom) {
  CornerQuad q;
  SetPoint(q.corner[0], left, top);
  SetPoint(q.corner[1], right, top);
  SetPoint(q.corner[2], right, bottom);
  SetPoint(q.corner[3], left, bottom);
  return q;
}

constexpr Rect kImage{0, 0, 800, 1000};

TEST(RoundCornersTest, HalfAwayFromZeroIntoSixteenBits) {
  const BoxCorners box = {{{-0.5, 0.5}, {2.4999, -2.5}, {70000.0, 1.5}, {-1e10, -0.4}}};
  CornerQuad q;
  RoundCorners(box, q);
  EXPECT_EQ(q.corner[0].h, -1);
  EXPECT_EQ(q.corner[0].v, 1);
  EXPECT_EQ(q.corner[1].h, 2);
  EXPECT_EQ(q.corner[1].v, -3);
  EXPECT_EQ(q.corner[2].h, static_cast<int16_t>(70000 - 65536));  // low 16 bits
  EXPECT_EQ(q.corner[2].v, 2);
  EXPECT_EQ(q.corner[3].h, 0);  // no 32-bit value: the low bits of INT32_MIN
  EXPECT_EQ(q.corner[3].v, 0);
}

TEST(SnapCornersTest, SidesTwelvePixelsInsideSnapThirteenDoNot) {
  CornerQuad q = Quad(12, 12, 1000 - 12, 800 - 12);
  SnapCorners(q, kImage);
  EXPECT_EQ(q.corner[0].h, 0);
  EXPECT_EQ(q.corner[0].v, 0);
  EXPECT_EQ(q.corner[1].h, 999);
  EXPECT_EQ(q.corner[1].v, 0);
  EXPECT_EQ(q.corner[2].h, 999);
  EXPECT_EQ(q.corner[2].v, 799);
  EXPECT_EQ(q.corner[3].h, 0);
  EXPECT_EQ(q.corner[3].v, 799);

  CornerQuad far = Quad(13, 13, 1000 - 13, 800 - 13);
  SnapCorners(far, kImage);
  EXPECT_EQ(far.corner[0].h, 13);
  EXPECT_EQ(far.corner[0].v, 13);
  EXPECT_EQ(far.corner[2].h, 987);
  EXPECT_EQ(far.corner[2].v, 787);
}

TEST(SnapCornersTest, ACornerOnTheSideBlocksItsPartner) {
  CornerQuad q = Quad(5, 5, 900, 700);
  q.corner[3].h = 0;  // bottom-left on the left side: left side stays
  SnapCorners(q, kImage);
  EXPECT_EQ(q.corner[0].h, 5);
  EXPECT_EQ(q.corner[3].h, 0);
  EXPECT_EQ(q.corner[0].v, 0);  // the top side still snaps
  EXPECT_EQ(q.corner[1].v, 0);
}

TEST(SnapCornersTest, OneNearCornerAloneStays) {
  CornerQuad q = Quad(5, 100, 900, 700);
  q.corner[3].h = 40;
  SnapCorners(q, kImage);
  EXPECT_EQ(q.corner[0].h, 5);
  EXPECT_EQ(q.corner[3].h, 40);
}

TEST(SnapCornersTest, OutsideCornersBlockTheSnap) {
  CornerQuad q = Quad(-3, 4, 1003, 804);
  q.corner[3].h = 4;
  SnapCorners(q, kImage);
  EXPECT_EQ(q.corner[0].h, -3);
  EXPECT_EQ(q.corner[3].h, 4);
  EXPECT_EQ(q.corner[2].h, 1003);
}

TEST(SnapCornersTest, WholeImageCornersPassUnchanged) {
  CornerQuad q;
  FullImageCorners(q, kImage);
  const CornerQuad before = q;
  SnapCorners(q, kImage);
  for (int k = 0; k < 4; ++k) {
    EXPECT_EQ(q.corner[k].h, before.corner[k].h);
    EXPECT_EQ(q.corner[k].v, before.corner[k].v);
  }
}

}  // namespace
