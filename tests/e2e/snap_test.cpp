// Corners near a side of the image snap onto it: a side whose two corners both
// lie 1 to 12 pixels inside moves onto the side; at 13 nothing moves. The
// unsnapped position of a corner is read from the opposite corner of the same
// upright photo, whose span is measured where no side is near.
#include <set>

#include "e2e_support.h"

namespace {

using E2E::ModuleTest;

constexpr int kWidth = 600, kHeight = 400;
constexpr double kPhotoWidth = 300, kPhotoHeight = 200;

class Snapping : public ModuleTest {
 protected:
  // The record of an upright photo whose top-left corner lies at (left, top).
  std::array<int16_t, 9> RecordFor(double left, double top) {
    Synth::PageRecipe recipe;
    recipe.width = kWidth;
    recipe.height = kHeight;
    recipe.noise = 1.0;
    recipe.photo = Synth::PhotoRecipe{left + kPhotoWidth / 2, top + kPhotoHeight / 2, kPhotoWidth,
                                      kPhotoHeight, 0.0};
    auto host = MakeHost(E2E::PageDocument(recipe));
    host->Run();
    ExpectClean(*host);
    auto records = E2E::RecordValues(*host);
    EXPECT_EQ(records.size(), 1u);
    EXPECT_EQ(records.empty() ? 0 : records[0][8], 255);
    return records.empty() ? std::array<int16_t, 9>{} : records[0];
  }
};

TEST_F(Snapping, LeftAndRightSidesSnapWithinTwelvePixels) {
  std::array<int16_t, 9> inside = RecordFor(100, 100);
  const int span = inside[3] - inside[1];  // corner 2 h - corner 1 h
  std::set<int> distances;
  for (int offset = 9; offset <= 15; ++offset) {
    // Left side near: its unsnapped place follows from the right-hand corners.
    std::array<int16_t, 9> r = RecordFor(offset, 100);
    int left = r[3] - span;
    distances.insert(left);
    int expected = (left >= 1 && left <= 12) ? 0 : left;
    EXPECT_EQ(r[1], expected) << "left side " << left << " px in";
    EXPECT_EQ(r[7], expected) << "left side " << left << " px in";

    // Right side near.
    r = RecordFor(kWidth - offset - kPhotoWidth, 100);
    int right = r[1] + span;
    int distance = kWidth - right;
    distances.insert(distance);
    expected = (distance >= 1 && distance <= 12) ? kWidth - 1 : right;
    EXPECT_EQ(r[3], expected) << "right side " << distance << " px in";
    EXPECT_EQ(r[5], expected) << "right side " << distance << " px in";
  }
  EXPECT_TRUE(distances.count(12) && distances.count(13)) << "the sweep missed the boundary";
}

TEST_F(Snapping, TopAndBottomSidesSnapWithinTwelvePixels) {
  std::array<int16_t, 9> inside = RecordFor(150, 100);
  const int span = inside[6] - inside[0];  // corner 4 v - corner 1 v
  std::set<int> distances;
  for (int offset = 9; offset <= 15; ++offset) {
    std::array<int16_t, 9> r = RecordFor(150, offset);
    int top = r[6] - span;
    distances.insert(top);
    int expected = (top >= 1 && top <= 12) ? 0 : top;
    EXPECT_EQ(r[0], expected) << "top side " << top << " px in";
    EXPECT_EQ(r[2], expected) << "top side " << top << " px in";

    r = RecordFor(150, kHeight - offset - kPhotoHeight);
    int bottom = r[0] + span;
    int distance = kHeight - bottom;
    distances.insert(distance);
    expected = (distance >= 1 && distance <= 12) ? kHeight - 1 : bottom;
    EXPECT_EQ(r[4], expected) << "bottom side " << distance << " px in";
    EXPECT_EQ(r[6], expected) << "bottom side " << distance << " px in";
  }
  EXPECT_TRUE(distances.count(12) && distances.count(13)) << "the sweep missed the boundary";
}

}  // namespace
