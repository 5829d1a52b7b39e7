// Takes apart a version-information resource.
#include "version_info.h"

#include <stdexcept>

namespace ResourceTest {
namespace {

std::string Utf16Ascii(ByteReader& reader, std::size_t units) {
  std::string text;
  for (std::size_t i = 0; i < units; ++i) {
    const std::uint16_t unit = reader.U16();
    if (unit >= 0x80) throw std::runtime_error("version text outside ASCII");
    text.push_back(static_cast<char>(unit));
  }
  return text;
}

std::string Utf16Key(ByteReader& reader) {
  std::string text;
  for (std::uint16_t unit = reader.U16(); unit != 0; unit = reader.U16()) {
    if (unit >= 0x80) throw std::runtime_error("version key outside ASCII");
    text.push_back(static_cast<char>(unit));
  }
  return text;
}

VersionNode ParseNode(const Bytes& bytes, std::size_t start, std::size_t limit) {
  ByteReader header(bytes, start, limit);
  const std::size_t length = header.U16();
  if (length < 6 || start + length > limit) throw std::runtime_error("version node length");
  ByteReader reader(bytes, start, start + length);
  reader.Skip(2);
  const std::size_t valueLength = reader.U16();
  const std::uint16_t type = reader.U16();
  if (type > 1) throw std::runtime_error("version node type");
  VersionNode node;
  node.key = Utf16Key(reader);
  reader.Align(4);
  node.isText = type == 1;
  if (node.isText) {
    // Text lengths count 16-bit units, the terminator included.
    ByteReader text(bytes, reader.Position(), start + length);
    node.text = Utf16Ascii(text, valueLength);
    while (!node.text.empty() && node.text.back() == '\0') node.text.pop_back();
    node.value = reader.Take(valueLength * 2);
  } else {
    node.value = reader.Take(valueLength);
  }
  reader.Align(4);
  while (!reader.AtEnd()) {
    VersionNode child = ParseNode(bytes, reader.Position(), start + length);
    ByteReader childHeader(bytes, reader.Position(), start + length);
    reader.Skip(childHeader.U16());
    reader.Align(4);
    node.children.push_back(std::move(child));
  }
  return node;
}

}  // namespace

VersionNode ParseVersionInfo(const Bytes& resource) {
  return ParseNode(resource, 0, resource.size());
}

const VersionNode& Child(const VersionNode& node, const std::string& key) {
  for (const VersionNode& child : node.children) {
    if (child.key == key) return child;
  }
  throw std::runtime_error("no version entry \"" + key + "\" under \"" + node.key + "\"");
}

}  // namespace ResourceTest
