// ComputeProfiles and ProfileCentroid.
//
// Outside the transparency cases every amount is a whole number and every
// profile entry stays far below 2^53, so the sums are exact in any grouping:
// one pass over the frame adds each row into 16-bit per-byte accumulators
// and a 16-bit row total, and the doubles are made at the end. In the
// transparency cases the amounts are fractions and keep their order: still
// one pass, each amount added to its row and to its column in turn.
//
// The host sees the same calls either way, and a cancel leaves the lists as
// two separate passes would: rows up to the cancel in the row pass, the
// partial column sums when the cancel falls in the column pass.
#include "filter/analysis/profiles.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>

#include "filter/analysis/allocation.h"
#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/kernel_choice.h"
#include "filter/analysis/pixel_access.h"

namespace Project {
namespace {

// 257 rows of 255 fill a 16-bit accumulator; 256 bytes of 255 a 16-bit total.
constexpr int32_t kRowsPerFlush = 257;
constexpr int32_t kBytesPerBlock = 256;

struct ProfileSource {
  const uint8_t* base;
  int32_t rowBytes;
  int32_t columnBytes;
  int32_t width;
  int32_t height;
  int16_t channels;
  bool transparency;

  const uint8_t* Row(int32_t y) const { return PixelAt(base, 0, y, rowBytes, columnBytes); }
};

// What pixel's channel k adds in the transparency cases.
inline double FractionAmount(const uint8_t* pixel, int16_t k, double opacity) {
  return static_cast<double>(255 - pixel[k]) * opacity;
}

inline double Opacity(const uint8_t* pixel, int16_t channels) {
  return static_cast<double>(pixel[channels]) / 255.0;
}

// Column entries as a column pass stopped before row `rows` leaves them:
// cleared, then rows 0 ... rows - 1 added in order.
void PartialColumns(const ProfileSource& src, int32_t rows, double* columns) {
  std::fill_n(columns, src.width, 0.0);
  for (int32_t y = 0; y < rows; ++y) {
    const uint8_t* pixel = src.Row(y);
    for (int32_t x = 0; x < src.width; ++x) {
      if (src.transparency) {
        const double opacity = Opacity(pixel, src.channels);
        for (int16_t k = 0; k < src.channels; ++k) columns[x] += FractionAmount(pixel, k, opacity);
      } else {
        for (int16_t k = 0; k < src.channels; ++k) {
          columns[x] += static_cast<double>(255 - pixel[k]);
        }
      }
      pixel += src.columnBytes;
    }
  }
}

// The column pass's abort tests. False on a cancel, after leaving the column
// entries as the stopped pass would.
bool ColumnPassCalls(const ProfileSource& src, AnalysisHost& host, double* columns) {
  for (int32_t y = 0; y < src.height; ++y) {
    if (CancelRequested(host)) {
      PartialColumns(src, y, columns);
      return false;
    }
  }
  return true;
}

void Normalise(const ProfileSource& src, double* columns, double* rows) {
  const double scale = static_cast<double>(src.channels) * 255.0;
  for (int32_t x = 0; x < src.width; ++x) columns[x] /= scale;
  for (int32_t y = 0; y < src.height; ++y) rows[y] /= scale;
}

// Adds 255 - byte of `lanes` bytes to the 16-bit accumulators and answers
// their total.
FRINGE_KERNEL_BODY uint32_t AddRowLanesBody(const uint8_t* __restrict bytes,
                                            uint16_t* __restrict sums, int32_t lanes) {
  uint32_t total = 0;
  for (int32_t start = 0; start < lanes; start += kBytesPerBlock) {
    const int32_t end = std::min(start + kBytesPerBlock, lanes);
    uint16_t block = 0;
    for (int32_t i = start; i < end; ++i) {
      const auto dark = static_cast<uint8_t>(255 - bytes[i]);
      sums[i] = static_cast<uint16_t>(sums[i] + dark);
      block = static_cast<uint16_t>(block + dark);
    }
    total += block;
  }
  return total;
}

FRINGE_KERNEL_BODY void FlushLanesBody(uint16_t* __restrict sums, uint32_t* __restrict totals,
                                       int32_t lanes) {
  for (int32_t i = 0; i < lanes; ++i) totals[i] += sums[i];
  std::fill_n(sums, lanes, uint16_t{0});
}

uint32_t AddRowLanesPortable(const uint8_t* bytes, uint16_t* sums, int32_t lanes) {
  return AddRowLanesBody(bytes, sums, lanes);
}
void FlushLanesPortable(uint16_t* sums, uint32_t* totals, int32_t lanes) {
  FlushLanesBody(sums, totals, lanes);
}
#if FRINGE_WIDE_KERNELS
FRINGE_WIDE_TARGET uint32_t AddRowLanesWide(const uint8_t* bytes, uint16_t* sums, int32_t lanes) {
  return AddRowLanesBody(bytes, sums, lanes);
}
FRINGE_WIDE_TARGET void FlushLanesWide(uint16_t* sums, uint32_t* totals, int32_t lanes) {
  FlushLanesBody(sums, totals, lanes);
}
#endif

uint32_t AddRowLanes(const uint8_t* bytes, uint16_t* sums, int32_t lanes) {
#if FRINGE_WIDE_KERNELS
  if (UseWideKernels()) return AddRowLanesWide(bytes, sums, lanes);
#endif
  return AddRowLanesPortable(bytes, sums, lanes);
}

void FlushLanes(uint16_t* sums, uint32_t* totals, int32_t lanes) {
#if FRINGE_WIDE_KERNELS
  if (UseWideKernels()) {
    FlushLanesWide(sums, totals, lanes);
    return;
  }
#endif
  FlushLanesPortable(sums, totals, lanes);
}

// Pixels of packed channels (column distance = channel count): each row is
// one run of bytes. False when the workspace cannot be had.
bool WholeNumberPass(const ProfileSource& src, AnalysisHost& host, double* columns, double* rows,
                     ProgressCounter& progress, bool& stopped) {
  const int32_t lanes = src.width * src.channels;
  const auto size = static_cast<std::size_t>(lanes);
  const std::unique_ptr<uint16_t[]> sums = AllocateWorkspace<uint16_t>(size);
  const std::unique_ptr<uint32_t[]> totals = AllocateWorkspace<uint32_t>(size);
  if (!sums || !totals) return false;

  int32_t sinceFlush = 0;
  for (int32_t y = 0; y < src.height; ++y) {
    if (CancelRequested(host)) {
      stopped = true;
      return true;
    }
    TakeProgressStep(progress, host);
    rows[y] = static_cast<double>(AddRowLanes(src.Row(y), sums.get(), lanes));
    if (++sinceFlush == kRowsPerFlush) {
      FlushLanes(sums.get(), totals.get(), lanes);
      sinceFlush = 0;
    }
  }
  FlushLanes(sums.get(), totals.get(), lanes);
  std::fill_n(columns, src.width, 0.0);
  if (!ColumnPassCalls(src, host, columns)) {
    stopped = true;
    return true;
  }
  for (int32_t x = 0; x < src.width; ++x) {
    uint32_t column = 0;
    for (int16_t k = 0; k < src.channels; ++k) column += totals[x * src.channels + k];
    columns[x] = static_cast<double>(column);
  }
  return true;
}

// Pixels with room between them, whole-number amounts: one 32-bit total per
// column. False when the workspace cannot be had.
bool SpacedWholeNumberPass(const ProfileSource& src, AnalysisHost& host, double* columns,
                           double* rows, ProgressCounter& progress, bool& stopped) {
  const std::unique_ptr<uint32_t[]> totals =
      AllocateWorkspace<uint32_t>(static_cast<std::size_t>(src.width));
  if (!totals) return false;
  for (int32_t y = 0; y < src.height; ++y) {
    if (CancelRequested(host)) {
      stopped = true;
      return true;
    }
    TakeProgressStep(progress, host);
    const uint8_t* pixel = src.Row(y);
    uint32_t row = 0;
    for (int32_t x = 0; x < src.width; ++x) {
      uint32_t dark = 0;
      for (int16_t k = 0; k < src.channels; ++k) dark += 255U - pixel[k];
      totals[x] += dark;
      row += dark;
      pixel += src.columnBytes;
    }
    rows[y] = static_cast<double>(row);
  }
  std::fill_n(columns, src.width, 0.0);
  if (!ColumnPassCalls(src, host, columns)) {
    stopped = true;
    return true;
  }
  for (int32_t x = 0; x < src.width; ++x) columns[x] = static_cast<double>(totals[x]);
  return true;
}

// Transparency cases: fractions in their defined order, rows and columns
// side by side. False when the workspace cannot be had.
bool FractionPass(const ProfileSource& src, AnalysisHost& host, double* columns, double* rows,
                  ProgressCounter& progress, bool& stopped) {
  const std::unique_ptr<double[]> sums =
      AllocateWorkspace<double>(static_cast<std::size_t>(src.width));
  if (!sums) return false;
  for (int32_t y = 0; y < src.height; ++y) {
    if (CancelRequested(host)) {
      stopped = true;
      return true;
    }
    TakeProgressStep(progress, host);
    const uint8_t* pixel = src.Row(y);
    double row = 0.0;
    for (int32_t x = 0; x < src.width; ++x) {
      const double opacity = Opacity(pixel, src.channels);
      for (int16_t k = 0; k < src.channels; ++k) {
        const double amount = FractionAmount(pixel, k, opacity);
        row += amount;
        sums[x] += amount;
      }
      pixel += src.columnBytes;
    }
    rows[y] = row;
  }
  std::fill_n(columns, src.width, 0.0);
  if (!ColumnPassCalls(src, host, columns)) {
    stopped = true;
    return true;
  }
  std::copy_n(sums.get(), src.width, columns);
  return true;
}

// Without a workspace: a row pass and a column pass, as defined.
void TwoPasses(const ProfileSource& src, AnalysisHost& host, double* columns, double* rows,
               ProgressCounter& progress, bool& stopped) {
  for (int32_t y = 0; y < src.height; ++y) {
    if (CancelRequested(host)) {
      stopped = true;
      return;
    }
    TakeProgressStep(progress, host);
    const uint8_t* pixel = src.Row(y);
    double row = 0.0;
    for (int32_t x = 0; x < src.width; ++x) {
      if (src.transparency) {
        const double opacity = Opacity(pixel, src.channels);
        for (int16_t k = 0; k < src.channels; ++k) row += FractionAmount(pixel, k, opacity);
      } else {
        for (int16_t k = 0; k < src.channels; ++k) row += static_cast<double>(255 - pixel[k]);
      }
      pixel += src.columnBytes;
    }
    rows[y] = row;
  }
  std::fill_n(columns, src.width, 0.0);
  for (int32_t y = 0; y < src.height; ++y) {
    if (CancelRequested(host)) {
      PartialColumns(src, y, columns);
      stopped = true;
      return;
    }
  }
  PartialColumns(src, src.height, columns);
}

}  // namespace

void ComputeProfiles(const FrameView& frame, AnalysisHost& host, DoubleList& columns,
                     DoubleList& rows, ProgressCounter& progress) {
  const ProfileSource src{frame.inData,
                          frame.inRowBytes,
                          frame.inColumnBytes,
                          std::max<int32_t>(FrameWidth(frame), 0),
                          std::max<int32_t>(FrameHeight(frame), 0),
                          ChannelCount(frame.imageMode, 0),
                          HasTransparency(frame)};
  double* const columnData = columns.data.get();
  double* const rowData = rows.data.get();
  bool stopped = false;
  bool done = false;
  if (src.transparency) {
    done = FractionPass(src, host, columnData, rowData, progress, stopped);
  } else if (src.columnBytes == src.channels) {
    done = WholeNumberPass(src, host, columnData, rowData, progress, stopped);
  } else {
    done = SpacedWholeNumberPass(src, host, columnData, rowData, progress, stopped);
  }
  if (!done) TwoPasses(src, host, columnData, rowData, progress, stopped);
  if (!stopped) Normalise(src, columnData, rowData);
}

double ProfileCentroid(const DoubleList& profile) {
  const int32_t n = profile.count;
  if (n < 1) return 0.0;
  if (n == 1) return 0.5;
  double sum = 0.0;
  double moment = 0.0;
  for (int32_t i = 0; i < n; ++i) {
    sum += profile.data[i];
    moment += static_cast<double>(i) * profile.data[i];
  }
  if (moment == 0.0) return static_cast<double>(n) * 0.5;
  return moment / sum;
}

}  // namespace Project
