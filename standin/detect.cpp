// One detection: the page as a document, a whole run, and the answer read back.
#include "standin/detect.h"

#include <cstdlib>
#include <cstring>

#include "standin/fourcc.h"
#include "standin/host.h"

namespace Standin {

namespace {

constexpr int32_t kLargestSide = 32767;
constexpr uint32_t kRecordType = FourCC("fRNG");
constexpr size_t kRecordBytes = 18;
const char* const kSelectorNames[] = {"about", "parameters", "prepare",
                                      "start", "continue",   "finish"};

std::string CheckPage(const PageView& page) {
  if (page.width <= 0 || page.height <= 0) {
    return "the page is empty (" + std::to_string(page.width) + " x " +
           std::to_string(page.height) + ")";
  }
  if (page.width > kLargestSide || page.height > kLargestSide) {
    return "the page is " + std::to_string(page.width) + " x " + std::to_string(page.height) +
           " pixels; the host takes at most " + std::to_string(kLargestSide) + " on a side";
  }
  if (page.channels != 1 && page.channels != 3) {
    return "the page has " + std::to_string(page.channels) +
           " colour channels; only 1 (gray) or 3 (RGB) can be run";
  }
  if (page.pixels == nullptr) return "the page has no pixels";
  int64_t row = int64_t{page.width} * (page.channels + (page.alpha ? 1 : 0));
  if (std::llabs(page.rowBytes) < row) {
    return "the page's rows are " + std::to_string(page.rowBytes) + " bytes apart, less than a " +
           "row of pixels (" + std::to_string(row) + " bytes)";
  }
  if (page.rowBytes < 0) return "the page's rows run upward (a negative row distance)";
  return {};
}

std::string CheckFilterRect(const std::array<int32_t, 4>& rect, const PageView& page) {
  auto [top, left, bottom, right] = rect;
  if (top < 0 || left < 0 || bottom > page.height || right > page.width || top >= bottom ||
      left >= right) {
    return "the filter rectangle (" + std::to_string(top) + ", " + std::to_string(left) + ", " +
           std::to_string(bottom) + ", " + std::to_string(right) +
           ") is empty or not inside the page";
  }
  return {};
}

void ReadRecord(const Host& host, Detection& detection, std::string& error) {
  auto records = host.Records(kRecordType);
  if (records.empty()) {
    error = "the module stored no 'fRNG' record";
    return;
  }
  if (records.size() > 1) {
    error = "the document holds " + std::to_string(records.size()) + " 'fRNG' records";
    return;
  }
  if (records[0].size() != kRecordBytes) {
    error = "the 'fRNG' record has " + std::to_string(records[0].size()) + " bytes, not 18";
    return;
  }
  detection.recordPresent = true;
  std::memcpy(detection.record.data(), records[0].data(), kRecordBytes);
}

void ReadDescriptor(const Host& host, Detection& detection, std::string& error) {
  const std::optional<Descriptor>& descriptor = host.LastDescriptor();
  if (!descriptor) {
    error = "the module wrote no result descriptor";
    return;
  }
  static const uint32_t kPointKeys[8] = {FourCC("pt1v"), FourCC("pt1h"), FourCC("pt2v"),
                                         FourCC("pt2h"), FourCC("pt3v"), FourCC("pt3h"),
                                         FourCC("pt4v"), FourCC("pt4h")};
  std::optional<double> angle = descriptor->Float(FourCC("angl"));
  std::optional<int32_t> confidence = descriptor->Integer(FourCC("conf"));
  if (!angle || !confidence) {
    error = "the result descriptor lacks 'angl' or 'conf'";
    return;
  }
  for (size_t i = 0; i < 8; ++i) {
    std::optional<int32_t> value = descriptor->Integer(kPointKeys[i]);
    if (!value) {
      error = "the result descriptor lacks '" + FourCCText(kPointKeys[i]) + "'";
      return;
    }
    detection.points[i] = *value;
  }
  detection.descriptorPresent = true;
  detection.angle = *angle;
  detection.confidence = *confidence;
}

}  // namespace

Detection Detect(Module& module, const PageView& page, const DetectOptions& options) {
  Detection detection;
  detection.error = CheckPage(page);
  if (detection.error.empty() && options.filterRect) {
    detection.error = CheckFilterRect(*options.filterRect, page);
  }
  if (!detection.error.empty()) return detection;

  Document document(page.width, page.height, page.channels, page.alpha);
  document.BorrowPixels(page.pixels, page.rowBytes);
  if (options.filterRect) {
    document.filterRect = *options.filterRect;
    document.filterCase = page.alpha ? 5 : 2;  // a selection
  }
  Host host(module, std::move(document));
  RunReport report = host.Run();
  detection.selectorResults = report.results;

  std::string error;
  for (int16_t selector = kParameters; selector <= kFinish && error.empty(); ++selector) {
    auto index = static_cast<size_t>(selector);
    if (report.called[index] && report.results[index] != 0) {
      error = std::string("the ") + kSelectorNames[index] + " selector answered " +
              std::to_string(report.results[index]);
    }
  }
  std::string recordError, descriptorError;
  ReadRecord(host, detection, recordError);
  ReadDescriptor(host, detection, descriptorError);
  if (error.empty()) error = recordError;
  if (error.empty()) error = descriptorError;
  if (!host.Problems().Empty()) {
    std::string problems = "the host saw: " + host.Problems().Text();
    problems.pop_back();
    error = error.empty() ? problems : error + "; " + problems;
  }
  detection.error = error;
  return detection;
}

}  // namespace Standin
