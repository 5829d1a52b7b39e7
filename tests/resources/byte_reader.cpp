// Bounds-checked little-endian reading and writing of byte sequences.
#include "byte_reader.h"

#include <algorithm>

namespace ResourceTest {

ByteReader::ByteReader(const Bytes& bytes, std::size_t start, std::size_t end)
    : bytes_(bytes), position_(start), end_(std::min(end, bytes.size())) {
  if (start > end_) throw std::out_of_range("reader starts past the end of its bytes");
}

void ByteReader::Need(std::size_t count) const {
  if (count > end_ - position_) {
    std::string message = "read of ";
    message += std::to_string(count);
    message += " bytes at ";
    message += std::to_string(position_);
    message += " passes the end at ";
    message += std::to_string(end_);
    throw std::out_of_range(message);
  }
}

std::uint8_t ByteReader::U8() {
  Need(1);
  return bytes_[position_++];
}

std::uint16_t ByteReader::U16() {
  Need(2);
  const auto value = static_cast<std::uint16_t>(bytes_[position_] | (bytes_[position_ + 1] << 8));
  position_ += 2;
  return value;
}

std::uint32_t ByteReader::U32() {
  const std::uint32_t low = U16();
  const std::uint32_t high = U16();
  return low | (high << 16);
}

std::string ByteReader::Code() {
  const std::uint32_t value = U32();
  std::string code;
  for (int shift = 24; shift >= 0; shift -= 8) {
    code.push_back(static_cast<char>((value >> shift) & 0xFF));
  }
  return code;
}

std::string ByteReader::PString() {
  const std::size_t length = U8();
  const Bytes text = Take(length);
  return {text.begin(), text.end()};
}

std::string ByteReader::CString() {
  std::string text;
  for (std::uint8_t c = U8(); c != 0; c = U8()) text.push_back(static_cast<char>(c));
  return text;
}

Bytes ByteReader::Take(std::size_t count) {
  Need(count);
  const auto first = bytes_.begin() + static_cast<std::ptrdiff_t>(position_);
  position_ += count;
  return {first, first + static_cast<std::ptrdiff_t>(count)};
}

void ByteReader::Skip(std::size_t count) {
  Need(count);
  position_ += count;
}

void ByteReader::Align(std::size_t multiple) {
  const std::size_t over = position_ % multiple;
  if (over != 0) Skip(std::min(multiple - over, end_ - position_));
}

ByteWriter& ByteWriter::U8(std::uint8_t value) {
  bytes_.push_back(value);
  return *this;
}

ByteWriter& ByteWriter::U16(std::uint16_t value) {
  U8(static_cast<std::uint8_t>(value & 0xFF));
  return U8(static_cast<std::uint8_t>(value >> 8));
}

ByteWriter& ByteWriter::U32(std::uint32_t value) {
  U16(static_cast<std::uint16_t>(value & 0xFFFF));
  return U16(static_cast<std::uint16_t>(value >> 16));
}

ByteWriter& ByteWriter::Code(std::string_view code) {
  return U32(CodeValue(code));
}

ByteWriter& ByteWriter::PString(std::string_view text) {
  if (text.size() > 255) throw std::length_error("length-prefixed string over 255 bytes");
  U8(static_cast<std::uint8_t>(text.size()));
  for (const char c : text) U8(static_cast<std::uint8_t>(c));
  return *this;
}

ByteWriter& ByteWriter::CString(std::string_view text) {
  for (const char c : text) U8(static_cast<std::uint8_t>(c));
  return U8(0);
}

ByteWriter& ByteWriter::Append(const Bytes& bytes) {
  bytes_.insert(bytes_.end(), bytes.begin(), bytes.end());
  return *this;
}

ByteWriter& ByteWriter::PadTo(std::size_t multiple) {
  while (bytes_.size() % multiple != 0) U8(0);
  return *this;
}

ByteWriter& ByteWriter::Zeros(std::size_t count) {
  bytes_.insert(bytes_.end(), count, 0);
  return *this;
}

std::uint32_t CodeValue(std::string_view code) {
  if (code.size() != 4) throw std::invalid_argument("a four-character code needs four characters");
  std::uint32_t value = 0;
  for (const char c : code) value = (value << 8) | static_cast<std::uint8_t>(c);
  return value;
}

}  // namespace ResourceTest
