// Block means against the lid's surface, the largest connected region that
// departs from it, and the minimum-area rectangle around that region.
#include "refine/lid_seed.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <limits>
#include <vector>

namespace Refine {
namespace {

// A grid of square blocks over the sample area; each cell marks a block
// whose mean gray departs from the lid.
struct BlockGrid {
  int columns = 0;
  int rows = 0;
  int size = 1;  // block side, px
  double left = 0.0;
  double top = 0.0;
  std::vector<uint8_t> cells;

  uint8_t& At(int c, int r) { return cells[static_cast<size_t>(r) * columns + c]; }
  uint8_t At(int c, int r) const { return cells[static_cast<size_t>(r) * columns + c]; }
};

// Aim for about 400 blocks along the longer side: fine enough to put the
// seed within a few pixels of the sides, coarse enough to calm the noise.
constexpr double kBlocksAlong = 400.0;
// A region smaller than this share of the area is dust or a stain, not a photo.
constexpr double kMinShare = 0.01;

// How far a mean of size x size pixels may stray from the lid's surface and
// still be lid: its noise shrinks with the square root of its pixel count,
// the lid's own unevenness about the fitted surface stays.
double DepartureThreshold(const LidEstimate& lid, int size) {
  return std::max(3.0, 4.0 * lid.noise / size + 3.0 * lid.residual);
}

// Mean gray of the size x size pixels from (x0, y0), from a whole-number sum
// of their colour bytes.
double BlockMean(const PageImage& page, int32_t x0, int32_t y0, int size) {
  uint32_t sum = 0;
  for (int32_t y = y0; y < y0 + size; ++y) {
    const uint8_t* pixel = page.pixels + static_cast<std::ptrdiff_t>(y) * page.rowBytes +
                           static_cast<std::ptrdiff_t>(x0) * page.pixelBytes;
    for (int i = 0; i < size; ++i, pixel += page.pixelBytes)
      for (int ch = 0; ch < page.channels; ++ch) sum += pixel[ch];
  }
  return sum * (1.0 / (static_cast<double>(size) * size * page.channels));
}

BlockGrid MarkDepartures(const PageImage& page, const LidEstimate& lid, const SampleArea& area) {
  BlockGrid grid;
  const double spanX = area.right - area.left + 1.0;
  const double spanY = area.bottom - area.top + 1.0;
  grid.size = std::max(2, static_cast<int>(std::ceil(std::max(spanX, spanY) / kBlocksAlong)));
  grid.left = std::ceil(area.left);
  grid.top = std::ceil(area.top);
  grid.columns = static_cast<int>((std::floor(area.right) - grid.left + 1.0) / grid.size);
  grid.rows = static_cast<int>((std::floor(area.bottom) - grid.top + 1.0) / grid.size);
  if (grid.columns < 3 || grid.rows < 3) return grid;
  grid.cells.assign(static_cast<size_t>(grid.columns) * static_cast<size_t>(grid.rows), 0);

  const double threshold = DepartureThreshold(lid, grid.size);
  for (int r = 0; r < grid.rows; ++r) {
    const auto y0 = static_cast<int32_t>(grid.top) + r * grid.size;
    const double v = (y0 + 0.5 * grid.size) / page.height;
    for (int c = 0; c < grid.columns; ++c) {
      const auto x0 = static_cast<int32_t>(grid.left) + c * grid.size;
      const double u = (x0 + 0.5 * grid.size) / page.width;
      if (std::abs(BlockMean(page, x0, y0, grid.size) - LidAt(lid, u, v)) > threshold)
        grid.At(c, r) = 1;
    }
  }
  return grid;
}

// Sets every cell that has a `value` among its 3 x 3 neighbours inside the
// grid to `value`. Cells beyond the grid never count: for growing they are
// unmarked, for shrinking marked, so regions at the area's edge keep their extent.
void Spread(BlockGrid& grid, uint8_t value) {
  const BlockGrid before = grid;
  for (int r = 0; r < grid.rows; ++r)
    for (int c = 0; c < grid.columns; ++c) {
      bool near = false;
      for (int dr = -1; dr <= 1 && !near; ++dr)
        for (int dc = -1; dc <= 1 && !near; ++dc) {
          const int cc = c + dc, rr = r + dr;
          near = cc >= 0 && rr >= 0 && cc < grid.columns && rr < grid.rows &&
                 before.At(cc, rr) == value;
        }
      if (near) grid.At(c, r) = value;
    }
}

// Closes gaps of one block (a photo's lid-coloured patches): grows the marked
// cells by one, then shrinks them back.
void CloseGaps(BlockGrid& grid) {
  Spread(grid, 1);
  Spread(grid, 0);
}

// The cells of the largest 8-connected region, labelled 2 in the grid.
int KeepLargestRegion(BlockGrid& grid) {
  std::vector<int> labels(grid.cells.size(), 0);
  std::vector<int> stack;
  int best = 0, bestSize = 0, next = 0;
  for (size_t start = 0; start < grid.cells.size(); ++start) {
    if (!grid.cells[start] || labels[start]) continue;
    ++next;
    int size = 0;
    stack.assign(1, static_cast<int>(start));
    labels[start] = next;
    while (!stack.empty()) {
      const int cell = stack.back();
      stack.pop_back();
      ++size;
      const int c = cell % grid.columns, r = cell / grid.columns;
      for (int dr = -1; dr <= 1; ++dr)
        for (int dc = -1; dc <= 1; ++dc) {
          const int cc = c + dc, rr = r + dr;
          if (cc < 0 || rr < 0 || cc >= grid.columns || rr >= grid.rows) continue;
          const auto n = static_cast<size_t>(rr) * grid.columns + cc;
          if (grid.cells[n] && !labels[n]) {
            labels[n] = next;
            stack.push_back(static_cast<int>(n));
          }
        }
    }
    if (size > bestSize) {
      bestSize = size;
      best = next;
    }
  }
  for (size_t k = 0; k < grid.cells.size(); ++k) grid.cells[k] = labels[k] == best && best ? 2 : 0;
  return bestSize;
}

std::vector<Vec2> ConvexHull(std::vector<Vec2> points) {
  std::sort(points.begin(), points.end(),
            [](Vec2 a, Vec2 b) { return a.x < b.x || (a.x == b.x && a.y < b.y); });
  points.erase(std::unique(points.begin(), points.end()), points.end());
  if (points.size() < 3) return points;
  std::vector<Vec2> hull(2 * points.size());
  size_t k = 0;
  const auto turn = [&](Vec2 p) { return Cross(hull[k - 1] - hull[k - 2], p - hull[k - 2]); };
  for (const Vec2 p : points) {
    while (k >= 2 && turn(p) <= 0.0) --k;
    hull[k++] = p;
  }
  const size_t lower = k + 1;
  for (auto it = points.rbegin() + 1; it != points.rend(); ++it) {
    while (k >= lower && turn(*it) <= 0.0) --k;
    hull[k++] = *it;
  }
  hull.resize(k - 1);
  return hull;
}

}  // namespace

std::optional<Quad> MinimumAreaRectangle(std::vector<Vec2> points) {
  const std::vector<Vec2> hull = ConvexHull(std::move(points));
  if (hull.size() < 3) return std::nullopt;
  double bestArea = 0.0;
  std::optional<Quad> best;
  for (size_t i = 0; i < hull.size(); ++i) {
    const Vec2 edge = hull[(i + 1) % hull.size()] - hull[i];
    const double length = Length(edge);
    if (!(length > 0.0)) continue;
    // Turn the edge into the direction nearest +x, so that u runs along the
    // rectangle's top and v (u turned a quarter clockwise on screen) down it.
    Vec2 u = edge * (1.0 / length);
    while (!(u.x > 0.0 && std::abs(u.y) <= u.x)) u = {-u.y, u.x};
    const Vec2 v{-u.y, u.x};
    constexpr double kInf = std::numeric_limits<double>::infinity();
    double minU = kInf, maxU = -kInf, minV = kInf, maxV = -kInf;
    for (const Vec2 p : hull) {
      minU = std::min(minU, Dot(p, u));
      maxU = std::max(maxU, Dot(p, u));
      minV = std::min(minV, Dot(p, v));
      maxV = std::max(maxV, Dot(p, v));
    }
    const double area = (maxU - minU) * (maxV - minV);
    if (!(area > 0.0) || (best && area >= bestArea)) continue;
    bestArea = area;
    best = Quad{u * minU + v * minV, u * maxU + v * minV, u * maxU + v * maxV, u * minU + v * maxV};
  }
  return best;
}

bool DepartsOutside(const PageImage& page, const LidEstimate& lid, const SampleArea& area,
                    const Quad& outline) {
  if (!CheckPageImage(page).empty() || !(lid.level > 0.0)) return false;
  constexpr int kSize = 4;  // means of 4 x 4 pixels
  constexpr int kPoints = 16;
  const double threshold = DepartureThreshold(lid, kSize);
  for (int k = 0; k < 4; ++k) {
    const Vec2 a = outline[k], b = outline[(k + 1) % 4];
    const double length = Distance(a, b);
    if (!(length > 0.0)) continue;
    // Outward: the side turned a quarter anticlockwise on screen.
    const Vec2 along = (b - a) * (1.0 / length);
    const Vec2 outward{along.y, -along.x};
    const double reach = std::clamp(0.05 * length, 16.0, 64.0);
    int seen = 0, departing = 0;
    for (int i = 0; i < kPoints; ++i) {
      const Vec2 p = a + (b - a) * ((i + 0.5) / kPoints) + outward * reach;
      const double left = std::floor(p.x) - kSize / 2 + 1, top = std::floor(p.y) - kSize / 2 + 1;
      if (!(left >= area.left && top >= area.top && left + kSize - 1 <= area.right &&
            top + kSize - 1 <= area.bottom))
        continue;
      ++seen;
      const double mean =
          BlockMean(page, static_cast<int32_t>(left), static_cast<int32_t>(top), kSize);
      if (std::abs(mean - LidAt(lid, p.x / page.width, p.y / page.height)) > threshold) ++departing;
    }
    if (seen >= kPoints / 2 && 2 * departing > seen) return true;
  }
  return false;
}

std::optional<LidSeed> SeedFromLid(const PageImage& page, const LidEstimate& lid,
                                   const SampleArea& area) {
  if (!CheckPageImage(page).empty() || !(lid.level > 0.0)) return std::nullopt;
  BlockGrid grid = MarkDepartures(page, lid, area);
  if (grid.cells.empty()) return std::nullopt;
  CloseGaps(grid);
  const int size = KeepLargestRegion(grid);
  if (size < kMinShare * static_cast<double>(grid.cells.size())) return std::nullopt;

  // Each row's outermost blocks, by their outer corners: all the hull needs.
  std::vector<Vec2> points;
  const double s = grid.size;
  for (int r = 0; r < grid.rows; ++r) {
    int first = -1, last = -1;
    for (int c = 0; c < grid.columns; ++c)
      if (grid.At(c, r)) {
        if (first < 0) first = c;
        last = c;
      }
    if (first < 0) continue;
    // Pixel centres at integers: a block's pixels x0 ... x0 + s - 1 cover
    // [x0 - 0.5, x0 + s - 0.5].
    const double top = grid.top + r * s - 0.5, bottom = top + s;
    const double left = grid.left + first * s - 0.5, right = grid.left + (last + 1) * s - 0.5;
    points.insert(points.end(), {{left, top}, {left, bottom}, {right, top}, {right, bottom}});
  }
  const std::optional<Quad> rectangle = MinimumAreaRectangle(std::move(points));
  if (!rectangle || !IsConvexClockwise(*rectangle)) return std::nullopt;
  LidSeed seed;
  seed.corners = *rectangle;
  seed.angle = OutlineAngleDegrees(seed.corners);
  seed.coverage = size * s * s / QuadArea(seed.corners);
  return seed;
}

}  // namespace Refine
