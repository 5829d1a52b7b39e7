// The framework's UTF-8 text.
#include "core/text.h"

namespace Vireo {

CText::CText(const char* literal) {
  if (literal == nullptr) return;
  for (const char* p = literal; *p != '\0'; ++p) {
    const auto byte = static_cast<unsigned char>(*p);
    bytes_ += byte >= 128 ? '?' : *p;
  }
}

CText CText::FromUtf8(std::string_view utf8) {
  CText text;
  text.bytes_.assign(utf8.data(), utf8.size());
  return text;
}

size_t CText::CharacterLength() const {
  size_t count = 0;
  for (char c : bytes_) {
    // Continuation bytes (10xxxxxx) belong to the character before them.
    if ((static_cast<unsigned char>(c) & 0xC0) != 0x80) ++count;
  }
  return count;
}

CText& CText::operator+=(const CText& tail) {
  bytes_ += tail.bytes_;
  return *this;
}

CText operator+(CText head, const CText& tail) {
  head += tail;
  return head;
}

}  // namespace Vireo
