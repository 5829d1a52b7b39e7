// FindEdgePoints.
//
// The passes share what they learn. Pass 1 gives each row's first edge
// pixel; pass 2 then needs to look only from the right end back to it (and
// at the right end alone when pass 1 found none). Together they give each
// row's leftmost and rightmost edge pixel, so a column pass tests a row only
// where that span covers the column, and walks only the rows from the first
// to the last that has an edge pixel. The column passes take a band of
// columns row by row, so that a row's bytes serve the whole band while they
// are in the cache. Every answer is the one a full scan of the line gives,
// and each line's abort test and progress step still come first, in line
// order. Without a workspace for the row spans, every line is scanned whole.
#include "filter/analysis/edge_points.h"

#include <algorithm>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"
#include "filter/analysis/plane_scan.h"

namespace Project {
namespace {

constexpr int32_t kBand = 64;  // columns scanned side by side
constexpr int32_t kNone = -1;

// Keeps a coordinate at least one pixel inside the frame: 1 ... extent - 2.
int16_t ClampInside(int16_t value, int16_t extent) {
  if (value < 1) value = 1;
  if (value >= extent - 1) value = static_cast<int16_t>(extent - 2);
  return value;
}

struct PointSink {
  DoubleList& xs;
  DoubleList& ys;
  int32_t count = 0;

  void Add(int32_t x, int32_t y) {
    xs.data[count] = static_cast<double>(x);
    ys.data[count] = static_cast<double>(y);
    ++count;
  }
};

bool Fail(DoubleList& xs, DoubleList& ys) {
  FreeList(xs);
  FreeList(ys);
  return false;
}

// The leftmost and rightmost edge column of each row, once both row passes
// are through; kNone for a row without an edge pixel.
struct RowSpans {
  std::unique_ptr<int32_t[]> first;  // from pass 1 (columns left ... right - 1)
  std::unique_ptr<int32_t[]> last;   // from pass 2 (columns left + 1 ... right)

  bool Known() const { return first != nullptr; }
  int32_t Low(int32_t row) const { return first[row] != kNone ? first[row] : last[row]; }
  int32_t High(int32_t row) const { return last[row] != kNone ? last[row] : first[row]; }
};

class Search {
 public:
  Search(const FrameView& frame, const PlaneScanner& scan, int32_t left, int32_t right, int32_t top,
         int32_t bottom)
      : frame_(frame), scan_(scan), left_(left), right_(right), top_(top), bottom_(bottom) {
    const auto rows = static_cast<std::size_t>(bottom - top + 1);
    spans_.first = AllocateWorkspace<int32_t>(rows);
    spans_.last = AllocateWorkspace<int32_t>(rows);
    if (!spans_.first || !spans_.last) spans_ = {};
  }

  bool RowPass(bool fromLeft, AnalysisHost& host, ProgressCounter& progress, PointSink& sink) {
    for (int32_t y = top_; y <= bottom_; ++y) {
      if (CancelRequested(host)) return false;
      TakeProgressStep(progress, host);
      const int32_t x = fromLeft ? FromLeft(y) : FromRight(y);
      if (x != kNone) sink.Add(x, y);
    }
    return true;
  }

  bool ColumnPass(bool fromTop, AnalysisHost& host, ProgressCounter& progress, PointSink& sink) {
    FindEdgeRows();
    int32_t rows[kBand];
    for (int32_t first = left_; first <= right_; first += kBand) {
      const int32_t count = std::min(kBand, right_ - first + 1);
      BandPoints(first, count, fromTop, rows);
      for (int32_t j = 0; j < count; ++j) {
        if (CancelRequested(host)) return false;
        TakeProgressStep(progress, host);
        if (rows[j] != kNone) sink.Add(first + j, rows[j]);
      }
    }
    return true;
  }

 private:
  const uint8_t* Pixel(int32_t x, int32_t y) const {
    return PixelAt(frame_.inData, x, y, frame_.inRowBytes, frame_.inColumnBytes);
  }

  // Pass 1: columns left ... right - 1.
  int32_t FromLeft(int32_t y) {
    const int32_t i = scan_.First(Pixel(left_, y), right_ - left_);
    const int32_t x = i < 0 ? kNone : left_ + i;
    if (spans_.Known()) spans_.first[y - top_] = x;
    return x;
  }

  // Pass 2: columns right ... left + 1, the first edge from the right.
  int32_t FromRight(int32_t y) {
    int32_t low = left_ + 1;
    if (spans_.Known()) {
      const int32_t fromLeft = spans_.first[y - top_];
      // No edge before the right end: only the right end is left to test.
      // Otherwise the first edge from the left bounds the search.
      low = fromLeft == kNone ? right_ : std::max(fromLeft, left_ + 1);
    }
    const int32_t i = scan_.Last(Pixel(low, y), right_ - low + 1);
    const int32_t x = i < 0 ? kNone : low + i;
    if (spans_.Known()) spans_.last[y - top_] = x;
    return x;
  }

  // The first and last row with an edge pixel, once the row passes are
  // through: the column passes need not walk the rows outside them. With
  // no row spans every row is walked.
  void FindEdgeRows() {
    edgeRowsLow_ = top_;
    edgeRowsHigh_ = bottom_;
    if (!spans_.Known()) return;
    while (edgeRowsLow_ <= bottom_ && spans_.Low(edgeRowsLow_ - top_) == kNone) ++edgeRowsLow_;
    while (edgeRowsHigh_ >= top_ && spans_.Low(edgeRowsHigh_ - top_) == kNone) --edgeRowsHigh_;
  }

  // Pass 3 (from the top) or 4 (from the bottom) for columns first ...
  // first + count - 1: the row of each column's point, or kNone.
  void BandPoints(int32_t first, int32_t count, bool fromTop, int32_t* rows) const {
    std::fill_n(rows, count, kNone);
    // Rows top ... bottom - 1 from the top, bottom ... top + 1 from the
    // bottom, less those outside the rows with an edge pixel.
    const int32_t start = fromTop ? std::max(top_, edgeRowsLow_) : std::min(bottom_, edgeRowsHigh_);
    const int32_t end = fromTop ? std::min(bottom_ - 1, edgeRowsHigh_)
                                : std::max(top_ + 1, edgeRowsLow_);  // scanned
    const int32_t dy = fromTop ? 1 : -1;
    const int32_t stop = end + dy;
    const int32_t bandLast = first + count - 1;
    uint64_t open = count == 64 ? ~0ULL : (1ULL << count) - 1;
    const bool none = fromTop ? start > end : start < end;
    for (int32_t y = start; !none && y != stop && open != 0; y += dy) {
      int32_t low = first;
      int32_t high = bandLast;
      if (spans_.Known()) {
        const int32_t spanLow = spans_.Low(y - top_);
        if (spanLow == kNone) continue;
        low = std::max(low, spanLow);
        high = std::min(high, spans_.High(y - top_));
      }
      for (int32_t x = low; x <= high; ++x) {
        const uint64_t bit = 1ULL << (x - first);
        if ((open & bit) != 0 && scan_.IsEdge(Pixel(x, y))) {
          rows[x - first] = y;
          open &= ~bit;
        }
      }
    }
  }

  const FrameView& frame_;
  const PlaneScanner& scan_;
  int32_t left_;
  int32_t right_;
  int32_t top_;
  int32_t bottom_;
  RowSpans spans_;
  int32_t edgeRowsLow_ = 0;
  int32_t edgeRowsHigh_ = 0;
};

}  // namespace

bool FindEdgePoints(const FrameView& frame, AnalysisHost& host, Rect search, DoubleList& xs,
                    DoubleList& ys, ProgressCounter& progress) {
  const int16_t width = FrameWidth(frame);
  const int16_t height = FrameHeight(frame);
  const int32_t left = ClampInside(search.left, width);
  const int32_t right = ClampInside(search.right, width);
  const int32_t top = ClampInside(search.top, height);
  const int32_t bottom = ClampInside(search.bottom, height);
  if (left >= right - 1 || top >= bottom - 1) return Fail(xs, ys);

  const int32_t capacity = 2 * ((right - left + 1) + (bottom - top + 1));
  if (!AllocList(xs, capacity) || !AllocList(ys, capacity)) return Fail(xs, ys);

  const int16_t channels = ChannelCount(frame.imageMode, 0);
  const PlaneScanner scan(frame.inColumnBytes, HasTransparency(frame) ? channels : -1);
  Search lines(frame, scan, left, right, top, bottom);
  PointSink sink{xs, ys};
  if (!lines.RowPass(true, host, progress, sink) || !lines.RowPass(false, host, progress, sink) ||
      !lines.ColumnPass(true, host, progress, sink) ||
      !lines.ColumnPass(false, host, progress, sink)) {
    return Fail(xs, ys);
  }
  if (sink.count == 0) return Fail(xs, ys);
  xs.count = sink.count;
  ys.count = sink.count;
  return true;
}

}  // namespace Project
