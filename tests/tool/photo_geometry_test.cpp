// The straightened frame of a detected photo: size, turn direction, and the
// resampling that cuts it out.
#include <gtest/gtest.h>

#include <cmath>

#include "photo_geometry.h"
#include "straightened_photo.h"
#include "synth_files.h"

namespace Fringe {
namespace {

// Corners of an upright box turned about its centre the way the module turns
// its fitted box back onto the page: x' = dx cos + dy sin + cx, y' = dy cos - dx sin + cy.
std::array<Corner, 4> TurnedBox(double cx, double cy, double w, double h, double degrees) {
  const double t = degrees * 3.14159265358979323846 / 180.0, c = std::cos(t), s = std::sin(t);
  const double hw = (w - 1) / 2, hh = (h - 1) / 2;
  const double box[4][2] = {{-hw, -hh}, {hw, -hh}, {hw, hh}, {-hw, hh}};
  std::array<Corner, 4> out{};
  for (int k = 0; k < 4; ++k) {
    const double dx = box[k][0], dy = box[k][1];
    out[k] = {static_cast<int32_t>(std::lround(dx * c + dy * s + cx)),
              static_cast<int32_t>(std::lround(dy * c - dx * s + cy))};
  }
  return out;
}

TEST(PhotoFrame, UprightBoxCountsBothCornerPixels) {
  const std::array<Corner, 4> box = {{{100, 50}, {599, 50}, {599, 399}, {100, 399}}};
  const PhotoFrame f = FrameOfPhoto(box, 0.0, 0);
  EXPECT_EQ(f.width, 500);
  EXPECT_EQ(f.height, 350);
  EXPECT_DOUBLE_EQ(f.centreX, 349.5);
  EXPECT_DOUBLE_EQ(f.centreY, 224.5);
  const PhotoFrame m = FrameOfPhoto(box, 0.0, 12);
  EXPECT_EQ(m.width, 524);
  EXPECT_EQ(m.height, 374);
}

TEST(PhotoFrame, TurnedBoxesKeepTheirSizeAndCornersMapBack) {
  for (double angle : {-44.0, -30.0, -7.5, 0.25, 12.0, 44.5}) {
    SCOPED_TRACE(angle);
    const auto corners = TurnedBox(640.0, 480.0, 701.0, 455.0, angle);
    const PhotoFrame f = FrameOfPhoto(corners, angle, 0);
    EXPECT_NEAR(f.width, 701, 1);
    EXPECT_NEAR(f.height, 455, 1);
    // The straightened photo's corner pixels are the detected corners: this
    // pins the direction of the turn.
    const double uv[4][2] = {
        {0, 0}, {f.width - 1.0, 0}, {f.width - 1.0, f.height - 1.0}, {0, f.height - 1.0}};
    for (int k = 0; k < 4; ++k) {
      const PagePoint p = PagePointOf(f, uv[k][0], uv[k][1]);
      EXPECT_NEAR(p.x, corners[k].x, 1.5) << "corner " << k;
      EXPECT_NEAR(p.y, corners[k].y, 1.5) << "corner " << k;
    }
  }
}

TEST(PhotoFrame, AffineMapIsTheInverseOfPagePlacement) {
  const PhotoFrame f{300.25, 211.5, 401, 280, -17.3};
  const AffineMap m = StraighteningMap(f);
  for (double u : {0.0, 17.0, 400.0}) {
    for (double v : {0.0, 139.5, 279.0}) {
      const PagePoint p = PagePointOf(f, u, v);
      const double x = m.matrix[0] * p.x + m.matrix[1] * p.y + m.odx;
      const double y = m.matrix[2] * p.x + m.matrix[3] * p.y + m.ody;
      EXPECT_NEAR(x, u, 1e-9);
      EXPECT_NEAR(y, v, 1e-9);
    }
  }
}

// The position of the brightest pixel.
int32_t BrightestX(const vips::VImage& image, int32_t& y) {
  int x = 0;
  image.max(vips::VImage::option()->set("x", &x)->set("y", &y));
  return x;
}

// A black page with one white pixel: the straightened photo must carry that
// pixel to where the frame says it lies.
TEST(StraightenedPhoto, OutputPixelsSampleThePagePixelsTheFrameNames) {
  FringeTest::EnsureVips();
  struct Case {
    double angle;
    double u, v;  // where the dot should land in the output
  };
  for (const Case& c :
       {Case{0.0, 3, 7}, Case{90.0, 15, 4}, Case{-90.0, 2, 19}, Case{30.0, 10, 10}}) {
    SCOPED_TRACE(c.angle);
    const PhotoFrame f{50.0, 50.0, 21, 21, c.angle};
    const PagePoint p = PagePointOf(f, c.u, c.v);
    vips::VImage dot = vips::VImage::black(101, 101).copy_memory();
    dot.draw_rect({255}, static_cast<int>(std::lround(p.x)), static_cast<int>(std::lround(p.y)), 1,
                  1);
    DecodedPage page;
    page.image = dot;
    page.width = page.height = 101;
    page.channels = 1;
    const vips::VImage out = StraightenedPhoto(page, f);
    EXPECT_EQ(out.width(), 21);
    EXPECT_EQ(out.height(), 21);
    int32_t y = 0;
    const int32_t x = BrightestX(out, y);
    EXPECT_EQ(x, static_cast<int32_t>(c.u));
    EXPECT_EQ(y, static_cast<int32_t>(c.v));
  }
}

TEST(StraightenedPhoto, OutsideThePageIsWhiteOrTransparent) {
  FringeTest::EnsureVips();
  const PhotoFrame f{0.0, 0.0, 11, 11, 0.0};  // centred on the page's corner
  DecodedPage gray;
  gray.image = vips::VImage::black(40, 40).copy_memory();
  gray.width = gray.height = 40;
  gray.channels = 1;
  const vips::VImage a = StraightenedPhoto(gray, f);
  EXPECT_EQ(a.getpoint(0, 0)[0], 255.0);  // off the page
  EXPECT_EQ(a.getpoint(10, 10)[0], 0.0);  // on the page

  DecodedPage rgba;
  rgba.image = vips::VImage::black(40, 40, vips::VImage::option()->set("bands", 4))
                   .copy(vips::VImage::option()->set("interpretation", VIPS_INTERPRETATION_sRGB))
                   .new_from_image({10, 20, 30, 255})
                   .copy_memory();
  rgba.width = rgba.height = 40;
  rgba.channels = 3;
  rgba.alpha = true;
  const vips::VImage b = StraightenedPhoto(rgba, f);
  EXPECT_EQ(b.getpoint(0, 0)[3], 0.0);
  const std::vector<double> inside = b.getpoint(10, 10);
  EXPECT_EQ(inside, (std::vector<double>{10, 20, 30, 255}));
}

}  // namespace
}  // namespace Fringe
