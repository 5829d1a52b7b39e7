// Takes apart a version-information resource: the fixed block and the
// key/value tree of string and translation entries.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "byte_reader.h"

namespace ResourceTest {

struct VersionNode {
  std::string key;
  bool isText = false;
  Bytes value;       // raw value bytes
  std::string text;  // text nodes: the value as ASCII, without its terminator
  std::vector<VersionNode> children;
};

// Throws std::runtime_error or std::out_of_range on a malformed tree.
VersionNode ParseVersionInfo(const Bytes& resource);

// The child with the given key, or throws std::runtime_error.
const VersionNode& Child(const VersionNode& node, const std::string& key);

}  // namespace ResourceTest
