// The document's data records: for each four-character type a 1-based list of
// records, each a copy of the bytes it was added with.
#pragma once

#include <cstdint>
#include <map>
#include <vector>

namespace Standin {

struct StoredRecord {
  uint64_t serial = 0;  // unique among all records ever stored in the process
  std::vector<uint8_t> bytes;
};

class DataStore {
 public:
  int32_t Count(uint32_t type) const;
  // The record at 1-based `index`, or null when there is none.
  const StoredRecord* Get(uint32_t type, int32_t index) const;
  // False when there is no record at `index`.
  bool Delete(uint32_t type, int32_t index);
  // Appends a copy of `bytes`; answers the new record.
  const StoredRecord& Add(uint32_t type, std::vector<uint8_t> bytes);
  // Every record's bytes of one type, in list order.
  std::vector<std::vector<uint8_t>> Records(uint32_t type) const;
  void Clear() { lists_.clear(); }

 private:
  std::map<uint32_t, std::vector<StoredRecord>> lists_;
};

}  // namespace Standin
