// Lines, intersections and outline angles.
#include "refine/geometry.h"

#include <numbers>

namespace Refine {

std::optional<Line> LineThrough(Vec2 a, Vec2 b) {
  const Vec2 d = b - a;
  const double len = Length(d);
  if (!(len > 1e-12)) return std::nullopt;
  return Line{a, d * (1.0 / len)};
}

std::optional<Vec2> Intersect(const Line& a, const Line& b) {
  const double denom = Cross(a.direction, b.direction);
  // Sides that meet at less than about a degree give corners we cannot trust.
  if (std::abs(denom) < 0.017) return std::nullopt;
  const double t = Cross(b.point - a.point, b.direction) / denom;
  return a.point + a.direction * t;
}

std::optional<std::array<Line, 4>> SidesOf(const Quad& quad) {
  std::array<Line, 4> sides;
  for (int k = 0; k < 4; ++k) {
    auto line = LineThrough(quad[k], quad[(k + 1) % 4]);
    if (!line) return std::nullopt;
    sides[k] = *line;
  }
  return sides;
}

std::optional<Quad> CornersOf(const std::array<Line, 4>& sides) {
  Quad quad;
  // Corner k is where side k - 1 meets side k (the top-left corner joins left and top).
  for (int k = 0; k < 4; ++k) {
    auto corner = Intersect(sides[(k + 3) % 4], sides[k]);
    if (!corner) return std::nullopt;
    quad[k] = *corner;
  }
  return quad;
}

double FoldedDirectionDegrees(Vec2 direction) {
  double a = std::atan2(direction.y, direction.x) * (180.0 / std::numbers::pi);
  while (a >= 45.0) a -= 90.0;
  while (a < -45.0) a += 90.0;
  return a;
}

double OutlineAngleDegrees(const Quad& quad) {
  // Fold every side about the first one so that sides near +-45 do not cancel.
  double reference = 0.0;
  double weighted = 0.0;
  double total = 0.0;
  for (int k = 0; k < 4; ++k) {
    const Vec2 d = quad[(k + 1) % 4] - quad[k];
    const double len = Length(d);
    if (!(len > 0.0)) continue;
    double a = FoldedDirectionDegrees(d);
    if (total == 0.0) {
      reference = a;
    } else {
      if (a - reference > 45.0) a -= 90.0;
      if (a - reference < -45.0) a += 90.0;
    }
    weighted += a * len;
    total += len;
  }
  if (total == 0.0) return 0.0;
  return -(weighted / total);
}

double QuadArea(const Quad& quad) {
  double twice = 0.0;
  for (int k = 0; k < 4; ++k) twice += Cross(quad[k], quad[(k + 1) % 4]);
  return 0.5 * twice;
}

bool IsConvexClockwise(const Quad& quad) {
  for (int k = 0; k < 4; ++k) {
    const Vec2 a = quad[(k + 1) % 4] - quad[k];
    const Vec2 b = quad[(k + 2) % 4] - quad[(k + 1) % 4];
    // With y downward a clockwise-on-screen turn has a positive cross product.
    if (!(Cross(a, b) > 0.0)) return false;
  }
  return true;
}

}  // namespace Refine
