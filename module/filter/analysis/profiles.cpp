// ComputeProfiles and ProfileCentroid. The sums run channel by channel,
// pixel by pixel and row by row: that order fixes every bit of the result.
#include "filter/analysis/profiles.h"

#include <cstdint>

#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"

namespace Project {
namespace {

struct ProfileSource {
  const uint8_t* base;
  int32_t rowBytes;
  int32_t columnBytes;
  int32_t width;
  int16_t channels;
  bool transparency;

  const uint8_t* Row(int32_t y) const { return PixelAt(base, 0, y, rowBytes, columnBytes); }
};

// Adds the darkness of row y's pixels to *target, or to target[x] for column
// sums (stride 1); the amounts and their order are the same either way.
template <bool kTransparency>
void AddRowAmounts(const ProfileSource& src, int32_t y, double* target, int32_t stride) {
  const uint8_t* pixel = src.Row(y);
  double* entry = target;
  for (int32_t x = 0; x < src.width; ++x) {
    if constexpr (kTransparency) {
      const double opacity = static_cast<double>(pixel[src.channels]) / 255.0;
      for (int16_t k = 0; k < src.channels; ++k) {
        *entry += static_cast<double>(255 - pixel[k]) * opacity;
      }
    } else {
      for (int16_t k = 0; k < src.channels; ++k) {
        *entry += static_cast<double>(255 - pixel[k]);
      }
    }
    pixel += src.columnBytes;
    entry += stride;
  }
}

void AddRow(const ProfileSource& src, int32_t y, double* target, int32_t stride) {
  if (src.transparency) {
    AddRowAmounts<true>(src, y, target, stride);
  } else {
    AddRowAmounts<false>(src, y, target, stride);
  }
}

}  // namespace

void ComputeProfiles(const FrameView& frame, AnalysisHost& host, DoubleList& columns,
                     DoubleList& rows, ProgressCounter& progress) {
  const int16_t width = FrameWidth(frame);
  const int16_t height = FrameHeight(frame);
  const ProfileSource src{frame.inData,
                          frame.inRowBytes,
                          frame.inColumnBytes,
                          width,
                          ChannelCount(frame.imageMode, 0),
                          HasTransparency(frame)};

  for (int32_t y = 0; y < height; ++y) {
    if (CancelRequested(host)) return;
    TakeProgressStep(progress, host);
    rows.data[y] = 0.0;
    AddRow(src, y, &rows.data[y], 0);
  }

  for (int32_t x = 0; x < width; ++x) columns.data[x] = 0.0;
  for (int32_t y = 0; y < height; ++y) {
    if (CancelRequested(host)) return;
    AddRow(src, y, columns.data.get(), 1);
  }

  const double scale = static_cast<double>(src.channels) * 255.0;
  for (int32_t x = 0; x < width; ++x) columns.data[x] /= scale;
  for (int32_t y = 0; y < height; ++y) rows.data[y] /= scale;
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
