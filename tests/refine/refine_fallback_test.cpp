// When refinement cannot do better it keeps the module's answer and says so;
// the answer it is given is never changed.
#include "refine/refine.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

namespace Refine {
namespace {

// A gray page: an even lid with a photo whose content is given per pixel.
struct TestPage {
  int width = 640, height = 480;
  std::vector<uint8_t> pixels;
  PageImage View() const { return {width, height, 1, 1, pixels.data(), width}; }
};

template <typename Photo>
TestPage Paint(Photo photo) {
  TestPage page;
  page.pixels.resize(static_cast<size_t>(page.width) * static_cast<size_t>(page.height));
  for (int y = 0; y < page.height; ++y) {
    for (int x = 0; x < page.width; ++x) {
      // A faint fixed texture on the lid, so that it has a noise of its own.
      double v = 240.0 + ((x * 7 + y * 13) % 5) - 2.0;
      if (x >= 120 && x < 480 && y >= 100 && y < 360) v = photo(x, y);
      page.pixels[static_cast<size_t>(y) * static_cast<size_t>(page.width) +
                  static_cast<size_t>(x)] = static_cast<uint8_t>(std::lround(v));
    }
  }
  return page;
}

double Texture(int x, int y) {
  return 90.0 + 30.0 * std::sin(0.37 * x) * std::cos(0.23 * y);
}

// The module's answer 2.5 px outside the photo's edge on every side (its
// outermost pixels are 119 and 479 across, 99 and 359 down).
ModuleAnswer Loose() {
  ModuleAnswer a;
  a.corners = {Vec2{117, 97}, Vec2{482, 97}, Vec2{482, 362}, Vec2{117, 362}};
  a.angle = 0.0;
  a.confidence = 255;
  return a;
}

TEST(RefineFallback, FindsEverySideOfAPlainPhoto) {
  const TestPage page = Paint(Texture);
  const Refinement r = RefineOutline(page.View(), Loose());
  ASSERT_EQ(r.status, RefineStatus::kRefined) << r.reason;
  // Pixel centres at integers: the photo covers [119.5, 479.5] x [99.5, 359.5].
  const Quad expected{Vec2{119.5, 99.5}, Vec2{479.5, 99.5}, Vec2{479.5, 359.5}, Vec2{119.5, 359.5}};
  for (size_t k = 0; k < 4; ++k) {
    EXPECT_NEAR(r.outline[k].x, expected[k].x, 0.3) << k;
    EXPECT_NEAR(r.outline[k].y, expected[k].y, 0.3) << k;
  }
  EXPECT_NEAR(r.angle, 0.0, 0.02);
  for (const SideResult& side : r.sides) {
    EXPECT_EQ(side.status, SideStatus::kRefined);
    EXPECT_NEAR(side.shift, -2.5, 0.3);
    EXPECT_GT(side.support, 0.9);
  }
}

TEST(RefineFallback, AnInvisibleSideKeepsTheModulesLine) {
  // The photo fades into the lid toward its right side and has no texture there.
  const TestPage page = Paint([](int x, int y) {
    const double fade = (480.0 - x) / 360.0;
    return 240.0 - 150.0 * fade * fade + (x < 300 ? 10.0 * std::sin(0.5 * y) : 0.0);
  });
  const ModuleAnswer answer = Loose();
  const Refinement r = RefineOutline(page.View(), answer);
  ASSERT_EQ(r.status, RefineStatus::kPartial) << r.reason;
  EXPECT_EQ(r.sides[kRight].status, SideStatus::kKept);
  EXPECT_EQ(r.sides[kLeft].status, SideStatus::kRefined);
  // The right corners lie on the module's right side.
  EXPECT_NEAR(r.outline[1].x, 482.0, 1e-6);
  EXPECT_NEAR(r.outline[2].x, 482.0, 1e-6);
  EXPECT_NEAR(r.outline[0].x, 119.5, 0.3);
}

TEST(RefineFallback, NothingOnThePageMeansNoPhoto) {
  const TestPage page = Paint([](int x, int y) { return 240.0 + ((x * 7 + y * 13) % 5) - 2.0; });
  const Refinement r = RefineOutline(page.View(), Loose());
  EXPECT_EQ(r.status, RefineStatus::kNoPhoto);
  EXPECT_FALSE(r.reason.empty());
}

TEST(RefineFallback, TheModulesNoPhotoIsPassedOn) {
  const TestPage page = Paint(Texture);
  ModuleAnswer answer = Loose();
  answer.confidence = 0;
  const Refinement r = RefineOutline(page.View(), answer);
  EXPECT_EQ(r.status, RefineStatus::kNoPhoto);
  EXPECT_EQ(r.outline, answer.corners);
}

TEST(RefineFallback, CornersThatMakeNoOutlineAreKept) {
  const TestPage page = Paint(Texture);
  ModuleAnswer answer = Loose();
  std::swap(answer.corners[1], answer.corners[3]);  // anticlockwise
  const Refinement r = RefineOutline(page.View(), answer);
  EXPECT_EQ(r.status, RefineStatus::kKept);
  EXPECT_EQ(r.outline, answer.corners);
  EXPECT_EQ(r.angle, answer.angle);
}

TEST(RefineFallback, ABadPageViewIsKeptNotRead) {
  ModuleAnswer answer = Loose();
  const Refinement r = RefineOutline(PageImage{640, 480, 1, 1, nullptr, 640}, answer);
  EXPECT_EQ(r.status, RefineStatus::kKept);
  EXPECT_EQ(r.outline, answer.corners);
}

TEST(RefineFallback, AnswerOverTheWholePageStaysWithinIt) {
  // The module's failure answer: the whole page. Nothing outside is read.
  const TestPage page = Paint(Texture);
  ModuleAnswer answer;
  answer.corners = {Vec2{0, 0}, Vec2{639, 0}, Vec2{639, 479}, Vec2{0, 479}};
  answer.confidence = 255;
  const Refinement r = RefineOutline(page.View(), answer);
  if (r.status == RefineStatus::kRefined || r.status == RefineStatus::kPartial) {
    for (const Vec2& c : r.outline) {
      EXPECT_GE(c.x, 110.0);
      EXPECT_LE(c.x, 490.0);
    }
  }
}

TEST(RefineFallback, ModuleAnswerFromDescriptorPoints) {
  // pt1v, pt1h, pt2v, pt2h, ...: v is the row.
  const ModuleAnswer a = ModuleAnswer::FromPoints({10, 20, 11, 220, 150, 221, 149, 19}, -1.25, 255);
  EXPECT_EQ(a.corners[0].x, 20.0);
  EXPECT_EQ(a.corners[0].y, 10.0);
  EXPECT_EQ(a.corners[2].x, 221.0);
  EXPECT_EQ(a.corners[2].y, 150.0);
  EXPECT_TRUE(a.FoundPhoto());
  EXPECT_FALSE(ModuleAnswer::FromPoints({}, 0.0, 127).FoundPhoto());
}

}  // namespace
}  // namespace Refine

namespace Refine {
namespace {

TEST(RefineFallback, AnyAnswerOnAnyPageIsHandled) {
  // Odd pages and wild answers: off the page, degenerate, huge, tiny. Nothing
  // is read outside the page (the sanitizers watch) and the outline is finite.
  uint64_t state = 12345;
  auto next = [&state](int lo, int hi) {
    state = state * 6364136223846793005ULL + 1442695040888963407ULL;
    return lo + static_cast<int>((state >> 33) % static_cast<uint64_t>(hi - lo + 1));
  };
  const std::pair<int, int> sizes[] = {{1, 1}, {5, 300}, {64, 64}, {300, 200}};
  for (const auto& [w, h] : sizes) {
    std::vector<uint8_t> pixels(static_cast<size_t>(w) * static_cast<size_t>(h) * 3);
    for (auto& p : pixels) p = static_cast<uint8_t>(next(0, 255));
    const PageImage page{w, h, 3, 3, pixels.data(), static_cast<std::ptrdiff_t>(w) * 3};
    for (int i = 0; i < 60; ++i) {
      ModuleAnswer a;
      const int x0 = next(-400, 400), y0 = next(-400, 400), x1 = x0 + next(0, 700),
                y1 = y0 + next(0, 700);
      a.corners = {Vec2{static_cast<double>(x0), static_cast<double>(y0)},
                   Vec2{static_cast<double>(x1), static_cast<double>(y0 + next(-5, 5))},
                   Vec2{static_cast<double>(x1), static_cast<double>(y1)},
                   Vec2{static_cast<double>(x0), static_cast<double>(y1)}};
      a.angle = next(-45, 45);
      a.confidence = next(0, 1) == 0 ? 0 : 255;
      const Refinement r = RefineOutline(page, a);
      for (const Vec2& c : r.outline) {
        EXPECT_TRUE(std::isfinite(c.x) && std::isfinite(c.y));
      }
      EXPECT_TRUE(std::isfinite(r.angle));
      if (a.confidence == 0) {
        EXPECT_EQ(r.status, RefineStatus::kNoPhoto);
      }
    }
  }
}

}  // namespace
}  // namespace Refine
