// Darkness profiles, literally: a row pass and a column pass over the frame,
// each amount added as a double in channel, pixel and row order.
#include <cstdint>

#include "filter/analysis/channels.h"
#include "filter/analysis/frame_size.h"
#include "filter/analysis/host_calls.h"
#include "filter/analysis/pixel_access.h"
#include "filter/analysis/reference/literal_stages.h"

namespace Project::Reference {
namespace {

// What pixel (x, y) adds to its row and its column, channel k.
double Amount(const FrameView& frame, int32_t x, int32_t y, int16_t channels, int16_t k) {
  const uint8_t* pixel = PixelAt(frame.inData, x, y, frame.inRowBytes, frame.inColumnBytes);
  const double dark = static_cast<double>(255 - pixel[k]);
  if (!HasTransparency(frame)) return dark;
  return dark * (static_cast<double>(pixel[channels]) / 255.0);
}

}  // namespace

void ComputeProfiles(const FrameView& frame, AnalysisHost& host, DoubleList& columns,
                     DoubleList& rows, ProgressCounter& progress) {
  const int16_t width = FrameWidth(frame);
  const int16_t height = FrameHeight(frame);
  const int16_t channels = ChannelCount(frame.imageMode, 0);

  for (int16_t y = 0; y < height; ++y) {
    if (CancelRequested(host)) return;
    TakeProgressStep(progress, host);
    rows.data[y] = 0.0;
    for (int16_t x = 0; x < width; ++x) {
      for (int16_t k = 0; k < channels; ++k) rows.data[y] += Amount(frame, x, y, channels, k);
    }
  }
  for (int16_t x = 0; x < width; ++x) columns.data[x] = 0.0;
  for (int16_t y = 0; y < height; ++y) {
    if (CancelRequested(host)) return;
    for (int16_t x = 0; x < width; ++x) {
      for (int16_t k = 0; k < channels; ++k) columns.data[x] += Amount(frame, x, y, channels, k);
    }
  }
  const double scale = static_cast<double>(channels) * 255.0;
  for (int16_t x = 0; x < width; ++x) columns.data[x] /= scale;
  for (int16_t y = 0; y < height; ++y) rows.data[y] /= scale;
}

}  // namespace Project::Reference
