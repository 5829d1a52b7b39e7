// The framework's text: UTF-8 bytes. An 8-bit literal given to it keeps only
// its 7-bit bytes; every byte of 128 or more becomes a question mark, because
// literals are written in no defined encoding.
#pragma once

#include <string>
#include <string_view>

namespace Vireo {

class CText {
 public:
  CText() = default;
  // From an 8-bit literal (see above).
  CText(const char* literal);  // NOLINT(google-explicit-constructor): literals read naturally
  // From bytes that are already UTF-8.
  static CText FromUtf8(std::string_view utf8);

  const std::string& Utf8() const { return bytes_; }
  bool IsEmpty() const { return bytes_.empty(); }
  size_t ByteLength() const { return bytes_.size(); }
  // Characters, counting each UTF-8 sequence once.
  size_t CharacterLength() const;
  void Clear() { bytes_.clear(); }
  CText& operator+=(const CText& tail);

  friend bool operator==(const CText& a, const CText& b) { return a.bytes_ == b.bytes_; }

 private:
  std::string bytes_;
};

CText operator+(CText head, const CText& tail);

}  // namespace Vireo
