// Per-document record lists.
#include "standin/data_store.h"

#include <atomic>

namespace Standin {

namespace {
std::atomic<uint64_t> g_nextSerial{1};
}

int32_t DataStore::Count(uint32_t type) const {
  auto it = lists_.find(type);
  return it == lists_.end() ? 0 : static_cast<int32_t>(it->second.size());
}

const StoredRecord* DataStore::Get(uint32_t type, int32_t index) const {
  auto it = lists_.find(type);
  if (it == lists_.end() || index < 1 || index > static_cast<int32_t>(it->second.size())) {
    return nullptr;
  }
  return &it->second[static_cast<size_t>(index - 1)];
}

bool DataStore::Delete(uint32_t type, int32_t index) {
  auto it = lists_.find(type);
  if (it == lists_.end() || index < 1 || index > static_cast<int32_t>(it->second.size())) {
    return false;
  }
  it->second.erase(it->second.begin() + (index - 1));
  return true;
}

const StoredRecord& DataStore::Add(uint32_t type, std::vector<uint8_t> bytes) {
  std::vector<StoredRecord>& list = lists_[type];
  list.push_back(StoredRecord{g_nextSerial++, std::move(bytes)});
  return list.back();
}

std::vector<std::vector<uint8_t>> DataStore::Records(uint32_t type) const {
  std::vector<std::vector<uint8_t>> records;
  auto it = lists_.find(type);
  if (it != lists_.end()) {
    for (const StoredRecord& record : it->second) records.push_back(record.bytes);
  }
  return records;
}

}  // namespace Standin
