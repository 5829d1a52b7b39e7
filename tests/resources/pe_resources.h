// Reads the resource directory of a 64-bit Windows module file straight from
// its bytes: every resource with its type, name, language and data.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "byte_reader.h"

namespace ResourceTest {

// A resource type or name: a 16-bit identifier or a string (as stored, upper case).
struct ResourceKey {
  bool isName = false;
  std::uint16_t id = 0;
  std::string name;

  std::string ToString() const;
  friend bool operator==(const ResourceKey&, const ResourceKey&) = default;
};

struct Resource {
  ResourceKey type;
  ResourceKey name;
  std::uint16_t language = 0;
  Bytes data;
};

// Throws std::runtime_error naming what is wrong with a malformed file.
std::vector<Resource> ReadPeResources(const Bytes& file);

Bytes ReadFileBytes(const std::string& path);

}  // namespace ResourceTest
