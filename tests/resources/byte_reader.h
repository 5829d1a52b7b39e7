// Bounds-checked little-endian reading and writing of byte sequences, for
// taking module resources apart and for building the bytes they should hold.
#pragma once

#include <cstddef>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace ResourceTest {

using Bytes = std::vector<std::uint8_t>;

// Reads fields in order; running past the end throws std::out_of_range.
class ByteReader {
 public:
  explicit ByteReader(const Bytes& bytes, std::size_t start = 0, std::size_t end = SIZE_MAX);

  std::uint8_t U8();
  std::uint16_t U16();
  std::uint32_t U32();
  // A four-character code stored as a little-endian 32-bit integer whose most
  // significant byte is the first character.
  std::string Code();
  // One length byte, then that many bytes.
  std::string PString();
  // Bytes up to a NUL, which is consumed.
  std::string CString();
  Bytes Take(std::size_t count);
  void Skip(std::size_t count);
  // Skips to the next multiple of `multiple`, counted from the buffer's start.
  void Align(std::size_t multiple);

  std::size_t Position() const { return position_; }
  std::size_t Remaining() const { return end_ - position_; }
  bool AtEnd() const { return position_ == end_; }

 private:
  void Need(std::size_t count) const;

  const Bytes& bytes_;
  std::size_t position_;
  std::size_t end_;
};

// Appends fields; the counterpart of ByteReader.
class ByteWriter {
 public:
  ByteWriter& U8(std::uint8_t value);
  ByteWriter& U16(std::uint16_t value);
  ByteWriter& U32(std::uint32_t value);
  ByteWriter& Code(std::string_view code);
  ByteWriter& PString(std::string_view text);
  ByteWriter& CString(std::string_view text);
  ByteWriter& Append(const Bytes& bytes);
  ByteWriter& PadTo(std::size_t multiple);
  ByteWriter& Zeros(std::size_t count);

  const Bytes& Data() const { return bytes_; }
  std::size_t Size() const { return bytes_.size(); }

 private:
  Bytes bytes_;
};

// The 32-bit value of a four-character code, first character most significant.
std::uint32_t CodeValue(std::string_view code);

}  // namespace ResourceTest
