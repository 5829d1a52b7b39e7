// Builds the frame the host would deliver and runs the analysis driver on it.
#include "accuracy/memory_detector.h"

#include <stdexcept>
#include <vector>

#include "filter/analysis/driver.h"

namespace Accuracy {
namespace {

class QuietHost : public Project::AnalysisHost {
 public:
  bool TestAbort() override { return false; }
  void ReportProgress(int32_t, int32_t) override {}
  void SetResultCode(int16_t code) override { resultCode = code; }
  void WriteFringeRecord(const Project::CornerQuad&, int16_t) override {}
  void WriteEmptyFringeRecord() override {}
  int16_t resultCode = 0;
};

}  // namespace

Refine::ModuleAnswer MemoryDetector::Detect(const Refine::PageImage& page,
                                            const std::optional<Refine::FilterRect>& rect) {
  if (page.width > 32767 || page.height > 32767)
    throw std::runtime_error("page wider or taller than 32767");
  const Refine::FilterRect r = rect.value_or(Refine::FilterRect{0, 0, page.height, page.width});
  if (r[0] < 0 || r[1] < 0 || r[2] > page.height || r[3] > page.width || r[0] >= r[2] ||
      r[1] >= r[3])
    throw std::runtime_error("filter rectangle outside the page");
  const int rows = r[2] - r[0];
  const int columns = r[3] - r[1];
  const int channels = page.channels;
  // The host hands over the frame twice: the analysis writes its edge map into
  // the input copy and reads pixels from the output copy.
  std::vector<uint8_t> input(static_cast<size_t>(rows) * static_cast<size_t>(columns) *
                             static_cast<size_t>(channels));
  for (int y = 0; y < rows; ++y) {
    const uint8_t* src = page.pixels + static_cast<std::ptrdiff_t>(r[0] + y) * page.rowBytes +
                         static_cast<std::ptrdiff_t>(r[1]) * page.pixelBytes;
    uint8_t* dst = input.data() + static_cast<size_t>(y) * static_cast<size_t>(columns) *
                                      static_cast<size_t>(channels);
    for (int x = 0; x < columns; ++x)
      for (int k = 0; k < channels; ++k) dst[x * channels + k] = src[x * page.pixelBytes + k];
  }
  const std::vector<uint8_t> output = input;

  Project::FrameView frame;
  frame.imageMode = channels == 1 ? 1 : 3;
  frame.filterCase = 1;
  frame.planes = static_cast<int16_t>(channels);
  frame.documentRows = static_cast<int16_t>(page.height);
  frame.documentColumns = static_cast<int16_t>(page.width);
  frame.inRect = {static_cast<int16_t>(r[0]), static_cast<int16_t>(r[1]),
                  static_cast<int16_t>(r[2]), static_cast<int16_t>(r[3])};
  frame.inData = input.data();
  frame.inRowBytes = columns * channels;
  frame.inColumnBytes = channels;
  frame.outRect = frame.inRect;
  frame.outData = output.data();
  frame.outRowBytes = frame.inRowBytes;
  frame.outColumnBytes = channels;

  QuietHost host;
  Project::AnalysisResult result;  // a freshly loaded module's state
  Project::RunAnalysis(frame, host, result);

  Refine::ModuleAnswer answer;
  for (size_t k = 0; k < 4; ++k)
    answer.corners[k] = {static_cast<double>(result.corners.corner[k].h),
                         static_cast<double>(result.corners.corner[k].v)};
  answer.angle = result.angle;
  answer.confidence = result.confidence;
  return answer;
}

}  // namespace Accuracy
