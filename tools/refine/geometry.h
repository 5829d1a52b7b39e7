// Plane geometry for outlines: vectors, lines, intersections and quads, in
// page coordinates (x to the right, y downward, pixel centres at integers).
#pragma once

#include <array>
#include <cmath>
#include <optional>

namespace Refine {

struct Vec2 {
  double x = 0.0;
  double y = 0.0;
  bool operator==(const Vec2&) const = default;
};

inline Vec2 operator+(Vec2 a, Vec2 b) {
  return {a.x + b.x, a.y + b.y};
}
inline Vec2 operator-(Vec2 a, Vec2 b) {
  return {a.x - b.x, a.y - b.y};
}
inline Vec2 operator*(Vec2 a, double k) {
  return {a.x * k, a.y * k};
}
inline double Dot(Vec2 a, Vec2 b) {
  return a.x * b.x + a.y * b.y;
}
inline double Cross(Vec2 a, Vec2 b) {
  return a.x * b.y - a.y * b.x;
}
inline double Length(Vec2 a) {
  return std::hypot(a.x, a.y);
}
inline double Distance(Vec2 a, Vec2 b) {
  return Length(a - b);
}

// A line through a point along a unit direction.
struct Line {
  Vec2 point;
  Vec2 direction;
};

// The line through a and b; nullopt when they coincide.
std::optional<Line> LineThrough(Vec2 a, Vec2 b);

// Where two lines cross; nullopt when they are (nearly) parallel.
std::optional<Vec2> Intersect(const Line& a, const Line& b);

// Corners clockwise from the top-left one: top-left, top-right, bottom-right, bottom-left.
using Quad = std::array<Vec2, 4>;

// Side k runs from corner k to corner k + 1: top, right, bottom, left.
enum SideIndex { kTop = 0, kRight = 1, kBottom = 2, kLeft = 3 };
inline constexpr std::array<const char*, 4> kSideNames = {"top", "right", "bottom", "left"};

// The four sides of a quad as lines; nullopt when a side has no length.
std::optional<std::array<Line, 4>> SidesOf(const Quad& quad);

// Corners from four side lines (top, right, bottom, left); nullopt when two
// neighbouring sides are parallel.
std::optional<Quad> CornersOf(const std::array<Line, 4>& sides);

// The direction of a line folded into [-45, 45) degrees, measured in page
// coordinates (y downward): the turn of the nearest row or column direction.
double FoldedDirectionDegrees(Vec2 direction);

// The outline's angle as the module states it: degrees, positive when the
// photo is turned anticlockwise on screen; the mean of the four folded side
// directions, each weighted by its length, negated.
double OutlineAngleDegrees(const Quad& quad);

// Area of a quad (positive for the clockwise-on-screen corner order).
double QuadArea(const Quad& quad);

// True when the quad is convex with its corners in clockwise-on-screen order.
bool IsConvexClockwise(const Quad& quad);

}  // namespace Refine
