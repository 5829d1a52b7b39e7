// SpreadIntoThreeBytePixelsAvx2: sixteen pixels (48 bytes, three 16-byte
// blocks) at a time. For each block a byte shuffle moves the map bytes of
// the pixels that start in it to their places, and a byte blend takes them
// there while keeping every other byte of the block.
#include "platform/cpu/pixel_shuffle.h"

#if defined(__x86_64__) && (defined(__GNUC__) || defined(__clang__))
#include <immintrin.h>

#include <array>
#include <cstddef>

namespace Vireo::Platform {
namespace {

constexpr int32_t kPixelBytes = 3;
constexpr int32_t kBlockBytes = 16;
constexpr int32_t kPixelsPerRound = 16;  // three blocks

struct BlockPattern {
  std::array<uint8_t, kBlockBytes> source;  // the map byte for each byte, 0x80 for none
  std::array<uint8_t, kBlockBytes> take;    // 0xFF where the map byte goes
};

constexpr std::array<BlockPattern, kPixelBytes> MakePatterns() {
  std::array<BlockPattern, kPixelBytes> patterns{};
  for (int32_t block = 0; block < kPixelBytes; ++block) {
    for (int32_t j = 0; j < kBlockBytes; ++j) {
      const int32_t byte = block * kBlockBytes + j;
      const bool first = byte % kPixelBytes == 0;
      patterns[block].source[j] = first ? static_cast<uint8_t>(byte / kPixelBytes) : 0x80;
      patterns[block].take[j] = first ? 0xFF : 0x00;
    }
  }
  return patterns;
}

constexpr std::array<BlockPattern, kPixelBytes> kPatterns = MakePatterns();

__attribute__((target("avx2"))) __m128i Load(const uint8_t* bytes) {
  return _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes));
}

}  // namespace

__attribute__((target("avx2"))) void SpreadIntoThreeBytePixelsAvx2(const uint8_t* map,
                                                                   uint8_t* pixels, int32_t count) {
  __m128i source[kPixelBytes];
  __m128i take[kPixelBytes];
  for (int32_t block = 0; block < kPixelBytes; ++block) {
    source[block] = Load(kPatterns[block].source.data());
    take[block] = Load(kPatterns[block].take.data());
  }
  int32_t x = 0;
  for (; x + kPixelsPerRound <= count; x += kPixelsPerRound) {
    const __m128i bytes = Load(map + x);
    uint8_t* round = pixels + static_cast<std::ptrdiff_t>(x) * kPixelBytes;
    for (int32_t block = 0; block < kPixelBytes; ++block) {
      uint8_t* at = round + block * kBlockBytes;
      const __m128i placed = _mm_shuffle_epi8(bytes, source[block]);
      const __m128i merged = _mm_blendv_epi8(Load(at), placed, take[block]);
      _mm_storeu_si128(reinterpret_cast<__m128i*>(at), merged);
    }
  }
  for (; x < count; ++x) pixels[static_cast<std::ptrdiff_t>(x) * kPixelBytes] = map[x];
}

}  // namespace Vireo::Platform

#else

namespace Vireo::Platform {

void SpreadIntoThreeBytePixelsAvx2(const uint8_t* map, uint8_t* pixels, int32_t count) {
  for (int32_t x = 0; x < count; ++x) pixels[3 * x] = map[x];
}

}  // namespace Vireo::Platform

#endif
