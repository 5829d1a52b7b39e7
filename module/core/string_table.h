// Vireo::CStringTable: the run's cache of resolved key strings, a hash table
// of 1021 buckets of chained entries keyed by the bytes of the key path.
#pragma once

#include <array>
#include <cstddef>
#include <forward_list>
#include <string>
#include <string_view>

namespace Vireo {

class CStringTable {
 public:
  static constexpr std::size_t kBucketCount = 1021;

  // h = 0; for every byte b (unsigned): h = ((h << 8) | b) mod 1021.
  static std::size_t BucketOf(std::string_view key);

  // The resolved text cached under `key`, or null.
  const std::string* Find(std::string_view key) const;

  // Caches `text` under `key`, replacing an earlier text for the same key.
  void Insert(std::string_view key, std::string text);

  std::size_t Size() const { return size_; }

 private:
  struct Entry {
    std::string key;
    std::string text;
  };

  std::array<std::forward_list<Entry>, kBucketCount> buckets_;
  std::size_t size_ = 0;
};

}  // namespace Vireo
