// Outline geometry: intersections, corners from sides, the angle's sign.
#include "refine/geometry.h"

#include <gtest/gtest.h>

#include <cmath>
#include <numbers>

namespace Refine {
namespace {

Quad TurnedRectangle(double cx, double cy, double w, double h, double degrees) {
  // Anticlockwise on screen (y downward) for a positive angle.
  const double a = degrees * std::numbers::pi / 180.0;
  const double c = std::cos(a), s = std::sin(a);
  const double local[4][2] = {{-w / 2, -h / 2}, {w / 2, -h / 2}, {w / 2, h / 2}, {-w / 2, h / 2}};
  Quad q;
  for (int k = 0; k < 4; ++k)
    q[k] = {cx + local[k][0] * c + local[k][1] * s, cy - local[k][0] * s + local[k][1] * c};
  return q;
}

TEST(Geometry, LinesMeetWhereBothRun) {
  const auto a = LineThrough({0, 0}, {10, 10});
  const auto b = LineThrough({0, 10}, {10, 0});
  ASSERT_TRUE(a && b);
  const auto p = Intersect(*a, *b);
  ASSERT_TRUE(p);
  EXPECT_NEAR(p->x, 5.0, 1e-12);
  EXPECT_NEAR(p->y, 5.0, 1e-12);
  EXPECT_FALSE(LineThrough({3, 3}, {3, 3}));
}

TEST(Geometry, NearlyParallelSidesGiveNoCorner) {
  const auto a = LineThrough({0, 0}, {100, 0});
  const auto b = LineThrough({0, 5}, {100, 5.5});  // about 0.3 degrees apart
  ASSERT_TRUE(a && b);
  EXPECT_FALSE(Intersect(*a, *b));
}

TEST(Geometry, CornersOfTheSidesOfAQuadAreItsCorners) {
  const Quad q = TurnedRectangle(400, 300, 300, 200, 7.0);
  const auto sides = SidesOf(q);
  ASSERT_TRUE(sides);
  const auto back = CornersOf(*sides);
  ASSERT_TRUE(back);
  for (int k = 0; k < 4; ++k) {
    EXPECT_NEAR((*back)[k].x, q[k].x, 1e-9);
    EXPECT_NEAR((*back)[k].y, q[k].y, 1e-9);
  }
}

TEST(Geometry, AngleIsPositiveForAPhotoTurnedAnticlockwise) {
  EXPECT_NEAR(OutlineAngleDegrees(TurnedRectangle(500, 500, 400, 300, 3.5)), 3.5, 1e-9);
  EXPECT_NEAR(OutlineAngleDegrees(TurnedRectangle(500, 500, 400, 300, -12.0)), -12.0, 1e-9);
  // Sides near the folding limit do not cancel each other.
  EXPECT_NEAR(std::abs(OutlineAngleDegrees(TurnedRectangle(500, 500, 400, 300, 44.9))), 44.9, 1e-6);
}

TEST(Geometry, FoldedDirectionStaysWithinAQuarterTurn) {
  EXPECT_NEAR(FoldedDirectionDegrees({0.0, 1.0}), 0.0, 1e-12);   // a column
  EXPECT_NEAR(FoldedDirectionDegrees({-1.0, 0.0}), 0.0, 1e-12);  // a row, backwards
  EXPECT_NEAR(FoldedDirectionDegrees({1.0, 1.0}), -45.0, 1e-12);
  EXPECT_NEAR(FoldedDirectionDegrees({1.0, -0.1}), std::atan2(-0.1, 1.0) * 180.0 / std::numbers::pi,
              1e-12);
}

TEST(Geometry, ConvexClockwiseOutlinesOnly) {
  const Quad q = TurnedRectangle(200, 200, 100, 80, 5.0);
  EXPECT_TRUE(IsConvexClockwise(q));
  EXPECT_GT(QuadArea(q), 0.0);
  EXPECT_NEAR(QuadArea(q), 8000.0, 1e-6);
  const Quad reversed{q[3], q[2], q[1], q[0]};
  EXPECT_FALSE(IsConvexClockwise(reversed));
  Quad bowtie = q;
  std::swap(bowtie[1], bowtie[2]);
  EXPECT_FALSE(IsConvexClockwise(bowtie));
}

}  // namespace
}  // namespace Refine
