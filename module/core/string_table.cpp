// Vireo::CStringTable: the run's cache of resolved key strings.
#include "core/string_table.h"

namespace Vireo {

std::size_t CStringTable::BucketOf(std::string_view key) {
  std::size_t h = 0;
  for (const char c : key) {
    h = ((h << 8) | static_cast<unsigned char>(c)) % kBucketCount;
  }
  return h;
}

const std::string* CStringTable::Find(std::string_view key) const {
  for (const Entry& entry : buckets_[BucketOf(key)]) {
    if (entry.key == key) return &entry.text;  // same length and same bytes
  }
  return nullptr;
}

void CStringTable::Insert(std::string_view key, std::string text) {
  auto& chain = buckets_[BucketOf(key)];
  for (Entry& entry : chain) {
    if (entry.key == key) {
      entry.text = std::move(text);
      return;
    }
  }
  chain.push_front(Entry{std::string(key), std::move(text)});
  ++size_;
}

}  // namespace Vireo
