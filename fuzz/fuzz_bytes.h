// Reading decisions out of a fuzzer's input: each call takes the next bytes
// and, when the input is used up, answers zeros so that every input is a
// complete (if dull) case. Kept free of the fuzzer's own headers so that the
// same targets build with any compiler for replaying saved inputs.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace FuzzInput {

class Bytes {
 public:
  Bytes(const uint8_t* data, size_t size) : data_(data), size_(size) {}

  uint8_t Byte() { return pos_ < size_ ? data_[pos_++] : 0; }
  bool Bool() { return (Byte() & 1) != 0; }
  uint16_t U16() { return static_cast<uint16_t>(Byte() | (Byte() << 8)); }
  int16_t I16() { return static_cast<int16_t>(U16()); }
  uint32_t U32() { return static_cast<uint32_t>(U16()) | (static_cast<uint32_t>(U16()) << 16); }
  int32_t I32() { return static_cast<int32_t>(U32()); }
  // A value in [lo, hi], both included; lo when hi < lo.
  int32_t Range(int32_t lo, int32_t hi) {
    if (hi <= lo) return lo;
    const auto span = static_cast<uint32_t>(static_cast<int64_t>(hi) - lo) + 1u;
    const uint32_t raw = span <= 256 ? Byte() : span <= 65536 ? U16() : U32();
    return static_cast<int32_t>(lo + static_cast<int64_t>(raw % span));
  }
  // One of `values`.
  template <typename T, size_t N>
  T Pick(const T (&values)[N]) {
    return values[static_cast<size_t>(Range(0, static_cast<int32_t>(N) - 1))];
  }
  // Everything not yet read.
  std::vector<uint8_t> Rest() {
    std::vector<uint8_t> rest(data_ + pos_, data_ + size_);
    pos_ = size_;
    return rest;
  }
  // Up to `max` bytes, their count read first.
  std::string Text(size_t max) {
    size_t n = static_cast<size_t>(Range(0, static_cast<int32_t>(max)));
    if (n > size_ - pos_) n = size_ - pos_;
    std::string text(reinterpret_cast<const char*>(data_ + pos_), n);
    pos_ += n;
    return text;
  }
  bool Empty() const { return pos_ >= size_; }

 private:
  const uint8_t* data_;
  size_t size_;
  size_t pos_ = 0;
};

}  // namespace FuzzInput
