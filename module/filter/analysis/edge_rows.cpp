// The edge map's row kernels, each in a portable and an AVX2 build of the
// same loops. Loops for the common pixel layouts have the layout fixed at
// compile time, so that they become vector code; the rest run generic loops.
// The one exception: the AVX2 build writes the map into three-byte pixels
// with the platform's byte shuffle, which the compiler does not find.
#include "filter/analysis/edge_rows.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "filter/analysis/kernel_choice.h"
#include "platform/cpu/pixel_shuffle.h"

namespace Project {
namespace {

constexpr uint8_t kEdgeByte = 0;
constexpr uint8_t kNoEdgeByte = 255;

template <int32_t Step, int32_t Channels>
FRINGE_KERNEL_BODY void SumPixels(const uint8_t* __restrict row, int16_t* __restrict sums,
                                  int32_t count) {
  for (int32_t x = 0; x < count; ++x) {
    int32_t sum = 0;
    for (int32_t k = 0; k < Channels; ++k) sum += row[Step * x + k];
    sums[x] = static_cast<int16_t>(sum);
  }
}

FRINGE_KERNEL_BODY void SumPixelsAnyLayout(const uint8_t* row, int32_t step, int16_t channels,
                                           int16_t* sums, int32_t count) {
  for (int32_t x = 0; x < count; ++x) {
    const uint8_t* pixel = row + static_cast<std::ptrdiff_t>(x) * step;
    int32_t sum = 0;
    for (int16_t k = 0; k < channels; ++k) sum += pixel[k];
    sums[x] = static_cast<int16_t>(sum);
  }
}

template <typename Sum>
FRINGE_KERNEL_BODY void TermsFromSums(const Sum* __restrict p, int16_t* __restrict difference,
                                      int16_t* __restrict smooth, int32_t count) {
  for (int32_t x = 1; x < count - 1; ++x) {
    difference[x] = static_cast<int16_t>(p[x + 1] - p[x - 1]);
    smooth[x] = static_cast<int16_t>(p[x - 1] + 2 * p[x] + p[x + 1]);
  }
}

// The pixel sums of a row of more than one byte per pixel.
FRINGE_KERNEL_BODY void SumRow(const EdgeTermsJob& job) {
  const int32_t layout = job.step * 10 + job.channels;
  switch (layout) {
    case 21:
      SumPixels<2, 1>(job.row, job.sums, job.count);
      break;
    case 22:
      SumPixels<2, 2>(job.row, job.sums, job.count);
      break;
    case 33:
      SumPixels<3, 3>(job.row, job.sums, job.count);
      break;
    case 41:
      SumPixels<4, 1>(job.row, job.sums, job.count);
      break;
    case 43:
      SumPixels<4, 3>(job.row, job.sums, job.count);
      break;
    case 44:
      SumPixels<4, 4>(job.row, job.sums, job.count);
      break;
    default:
      SumPixelsAnyLayout(job.row, job.step, job.channels, job.sums, job.count);
      break;
  }
}

FRINGE_KERNEL_BODY void MakeTerms(const EdgeTermsJob& job) {
  if (job.step == 1 && job.channels == 1) {
    // One byte per pixel: the bytes are the sums.
    TermsFromSums(job.row, job.difference, job.smooth, job.count);
    return;
  }
  SumRow(job);
  TermsFromSums(job.sums, job.difference, job.smooth, job.count);
}

// The edge test for thresholds up to kSmallThreshold, in 16-bit lanes: with
// gx and gy clamped into -(3t + 1) ... 3t + 1 each square stays below 2^15
// and a capped value alone already exceeds 9t^2, so the answer is unchanged;
// and gx^2 + gy^2 > 9t^2 is asked as gx^2 > 9t^2 - gy^2, both sides in 16 bits.
constexpr int32_t kSmallThreshold = 60;

struct SmallTest {
  int16_t cap;    // 3t + 1
  int16_t limit;  // 9t^2

  uint8_t operator()(int16_t gx, int16_t gy) const {
    const auto ax = std::clamp<int16_t>(gx, static_cast<int16_t>(-cap), cap);
    const auto ay = std::clamp<int16_t>(gy, static_cast<int16_t>(-cap), cap);
    const auto squareX = static_cast<int16_t>(ax * ax);
    const auto rest = static_cast<int16_t>(limit - ay * ay);
    return squareX > rest ? kEdgeByte : kNoEdgeByte;
  }
};

struct WideTest {
  int32_t limit;

  uint8_t operator()(int16_t gx, int16_t gy) const {
    return int32_t{gx} * gx + int32_t{gy} * gy > limit ? kEdgeByte : kNoEdgeByte;
  }
};

// The terms of the row below made and used at once: one pass over the
// pixels reads the row below's sums and the older rows' terms, and writes
// the row below's terms and the map bytes.
template <typename Sum, typename Test>
FRINGE_KERNEL_BODY void TermsAndTest(const Sum* __restrict p, const EdgeTermsJob& below,
                                     const EdgeTestJob& job, Test test, uint8_t* __restrict out) {
  int16_t* __restrict d2 = below.difference;
  int16_t* __restrict s2 = below.smooth;
  const int16_t* __restrict d0 = job.difference[0];
  const int16_t* __restrict d1 = job.difference[1];
  const int16_t* __restrict s0 = job.smooth;
  for (int32_t x = job.first; x <= job.last; ++x) {
    const auto difference = static_cast<int16_t>(p[x + 1] - p[x - 1]);
    const auto smooth = static_cast<int16_t>(p[x - 1] + 2 * p[x] + p[x + 1]);
    d2[x] = difference;
    s2[x] = smooth;
    const auto gx = static_cast<int16_t>(d0[x] + 2 * d1[x] + difference);
    const auto gy = static_cast<int16_t>(smooth - s0[x]);
    out[x] = test(gx, gy);
  }
}

template <typename Test>
FRINGE_KERNEL_BODY void TermsAndTestAnySource(const EdgeTermsJob& below, const EdgeTestJob& job,
                                              Test test, uint8_t* out) {
  if (below.step == 1 && below.channels == 1) {
    TermsAndTest(below.row, below, job, test, out);
  } else {
    TermsAndTest(below.sums, below, job, test, out);
  }
}

// Map bytes into the first byte of pixels first ... last; the pixels' other
// bytes are read and written back unchanged, which lets the loop run in
// vector code.
template <int32_t Step>
FRINGE_KERNEL_BODY void SpreadMap(const uint8_t* __restrict map, uint8_t* __restrict target,
                                  int32_t first, int32_t last) {
  for (int32_t x = first; x <= last; ++x) {
    uint8_t kept[Step];
    for (int32_t k = 1; k < Step; ++k) kept[k] = target[Step * x + k];
    target[Step * x] = map[x];
    for (int32_t k = 1; k < Step; ++k) target[Step * x + k] = kept[k];
  }
}

FRINGE_KERNEL_BODY void SpreadMapAnyStep(const uint8_t* map, uint8_t* target, int32_t step,
                                         int32_t first, int32_t last) {
  for (int32_t x = first; x <= last; ++x) target[static_cast<std::ptrdiff_t>(x) * step] = map[x];
}

// Wide: the AVX2 build, which may call the platform's AVX2 shuffles.
template <bool Wide>
FRINGE_KERNEL_BODY void MapRow(const EdgeTermsJob& below, const EdgeTestJob& job) {
  if (below.step != 1 || below.channels != 1) SumRow(below);
  uint8_t* out = job.step == 1 ? job.target : job.map;
  if (job.threshold >= -kSmallThreshold && job.threshold <= kSmallThreshold) {
    const int32_t t = job.threshold < 0 ? -job.threshold : job.threshold;
    TermsAndTestAnySource(
        below, job, SmallTest{static_cast<int16_t>(3 * t + 1), static_cast<int16_t>(job.limit)},
        out);
  } else {
    TermsAndTestAnySource(below, job, WideTest{job.limit}, out);
  }
  switch (job.step) {
    case 1:
      break;
    case 2:
      SpreadMap<2>(job.map, job.target, job.first, job.last);
      break;
    case 3:
      if constexpr (Wide) {
        Vireo::Platform::SpreadIntoThreeBytePixelsAvx2(
            job.map + job.first, job.target + 3 * job.first, job.last - job.first + 1);
      } else {
        SpreadMap<3>(job.map, job.target, job.first, job.last);
      }
      break;
    case 4:
      SpreadMap<4>(job.map, job.target, job.first, job.last);
      break;
    default:
      SpreadMapAnyStep(job.map, job.target, job.step, job.first, job.last);
      break;
  }
}

void MakeTermsPortable(const EdgeTermsJob& job) {
  MakeTerms(job);
}
void MapRowPortable(const EdgeTermsJob& below, const EdgeTestJob& job) {
  MapRow<false>(below, job);
}
#if FRINGE_WIDE_KERNELS
FRINGE_WIDE_TARGET void MakeTermsWide(const EdgeTermsJob& job) {
  MakeTerms(job);
}
FRINGE_WIDE_TARGET void MapRowWide(const EdgeTermsJob& below, const EdgeTestJob& job) {
  MapRow<true>(below, job);
}
#endif

}  // namespace

void MakeEdgeTerms(const EdgeTermsJob& job) {
#if FRINGE_WIDE_KERNELS
  if (UseWideKernels()) {
    MakeTermsWide(job);
    return;
  }
#endif
  MakeTermsPortable(job);
}

void MapEdgeRow(const EdgeTermsJob& below, const EdgeTestJob& job) {
#if FRINGE_WIDE_KERNELS
  if (UseWideKernels()) {
    MapRowWide(below, job);
    return;
  }
#endif
  MapRowPortable(below, job);
}

}  // namespace Project
