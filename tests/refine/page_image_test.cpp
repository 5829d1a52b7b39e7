// Page views: the checks that keep reads inside the buffer, gray values and
// bilinear sampling.
#include "refine/page_image.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

namespace Refine {
namespace {

TEST(PageImage, ChecksRefuseWhatCannotBeReadSafely) {
  std::vector<uint8_t> pixels(4 * 3 * 3);
  PageImage ok{4, 3, 3, 3, pixels.data(), 12};
  EXPECT_EQ(CheckPageImage(ok), "");
  PageImage p = ok;
  p.pixels = nullptr;
  EXPECT_NE(CheckPageImage(p), "");
  p = ok;
  p.channels = 2;
  EXPECT_NE(CheckPageImage(p), "");
  p = ok;
  p.rowBytes = 11;  // shorter than four RGB pixels
  EXPECT_NE(CheckPageImage(p), "");
  p = ok;
  p.pixelBytes = 2;
  EXPECT_NE(CheckPageImage(p), "");
  p = ok;
  p.width = 0;
  EXPECT_NE(CheckPageImage(p), "");
  // A bottom-up buffer (negative row distance) is fine.
  p = ok;
  p.pixels = pixels.data() + 24;
  p.rowBytes = -12;
  EXPECT_EQ(CheckPageImage(p), "");
}

TEST(PageImage, GrayIsTheMeanOfTheColoursAndSkipsAlpha) {
  // Two RGBA pixels in a row.
  const std::vector<uint8_t> pixels = {30, 60, 90, 7, 255, 0, 0, 200};
  const PageImage page{2, 1, 3, 4, pixels.data(), 8};
  const GraySampler g(page);
  EXPECT_DOUBLE_EQ(g.Pixel(0, 0), 60.0);
  EXPECT_DOUBLE_EQ(g.Pixel(1, 0), 85.0);
}

TEST(PageImage, BilinearBetweenPixelCentres) {
  const std::vector<uint8_t> pixels = {0, 100, 50, 150};  // 2 x 2 gray
  const PageImage page{2, 2, 1, 1, pixels.data(), 2};
  const GraySampler g(page);
  double v = -1.0;
  ASSERT_TRUE(g.Sample(0.5, 0.0, v));
  EXPECT_DOUBLE_EQ(v, 50.0);
  ASSERT_TRUE(g.Sample(0.5, 0.5, v));
  EXPECT_DOUBLE_EQ(v, 75.0);
  ASSERT_TRUE(g.Sample(1.0, 1.0, v));
  EXPECT_DOUBLE_EQ(v, 150.0);
  EXPECT_FALSE(g.Sample(1.01, 0.0, v));
  EXPECT_FALSE(g.Sample(-0.01, 0.0, v));
  EXPECT_FALSE(g.Sample(0.0, std::nan(""), v));
}

}  // namespace
}  // namespace Refine
