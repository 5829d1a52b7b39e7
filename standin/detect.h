// One complete detection through a loaded module: the page becomes a document,
// the host runs parameters, prepare, start, continue and finish, and reads back
// the 'fRNG' record and the result descriptor.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>

#include "standin/error.h"
#include "standin/module.h"

namespace Standin {

// A page in memory, interleaved samples, 8 bits each. Not copied by the caller's
// side: it must stay alive for the duration of Detect.
struct PageView {
  int32_t width = 0, height = 0;
  int channels = 0;    // 1 gray or 3 RGB
  bool alpha = false;  // one more plane after the colours
  const uint8_t* pixels = nullptr;
  std::ptrdiff_t rowBytes = 0;
};

struct DetectOptions {
  std::optional<std::array<int32_t, 4>> filterRect;  // top, left, bottom, right
};

struct Detection {
  std::array<int16_t, 6>
      selectorResults{};  // parameters, prepare, start, continue, finish (index=selector)
  bool recordPresent = false;
  std::array<int16_t, 9> record{};  // 'fRNG' record values
  bool descriptorPresent = false;
  double angle = 0.0;
  int32_t confidence = 0;
  std::array<int32_t, 8> points{};  // pt1v, pt1h, ... pt4h
  std::string error;                // empty when the run completed; otherwise what went wrong
};

// Runs one detection. Problems with the page (no pixels, a side above 32767, an
// unsupported channel count, rows shorter than a row of pixels) are answered in
// `error` without running the module.
Detection Detect(Module& module, const PageView& page, const DetectOptions& options = {});

}  // namespace Standin
