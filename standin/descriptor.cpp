// Descriptor contents and their byte form.
#include "standin/descriptor.h"

#include <cstring>

#include "standin/fourcc.h"

namespace Standin {

namespace {

constexpr uint32_t kMagic = FourCC("DESC");
constexpr uint32_t kIntegerKind = FourCC("long");
constexpr uint32_t kFloatKind = FourCC("doub");
constexpr size_t kHeader = 8;
constexpr size_t kItem = 16;

template <typename T>
void Append(std::vector<uint8_t>& bytes, T value) {
  size_t at = bytes.size();
  bytes.resize(at + sizeof(T));
  std::memcpy(bytes.data() + at, &value, sizeof(T));
}

template <typename T>
T Read(const std::vector<uint8_t>& bytes, size_t offset) {
  T value;
  std::memcpy(&value, bytes.data() + offset, sizeof(T));
  return value;
}

}  // namespace

std::vector<uint32_t> Descriptor::Keys() const {
  std::vector<uint32_t> keys;
  for (const DescriptorItem& item : items_) keys.push_back(item.key);
  return keys;
}

const DescriptorItem* Descriptor::Last(uint32_t key) const {
  for (auto it = items_.rbegin(); it != items_.rend(); ++it) {
    if (it->key == key) return &*it;
  }
  return nullptr;
}

std::optional<int32_t> Descriptor::Integer(uint32_t key) const {
  const DescriptorItem* item = Last(key);
  if (item == nullptr || !std::holds_alternative<int32_t>(item->value)) return std::nullopt;
  return std::get<int32_t>(item->value);
}

std::optional<double> Descriptor::Float(uint32_t key) const {
  const DescriptorItem* item = Last(key);
  if (item == nullptr || !std::holds_alternative<double>(item->value)) return std::nullopt;
  return std::get<double>(item->value);
}

std::vector<uint8_t> Descriptor::Serialize() const {
  std::vector<uint8_t> bytes;
  Append(bytes, kMagic);
  Append(bytes, static_cast<uint32_t>(items_.size()));
  for (const DescriptorItem& item : items_) {
    Append(bytes, item.key);
    if (std::holds_alternative<int32_t>(item.value)) {
      Append(bytes, kIntegerKind);
      Append(bytes, static_cast<int64_t>(std::get<int32_t>(item.value)));
    } else {
      Append(bytes, kFloatKind);
      Append(bytes, std::get<double>(item.value));
    }
  }
  return bytes;
}

std::optional<Descriptor> Descriptor::Parse(const std::vector<uint8_t>& bytes,
                                            std::string* problem) {
  if (bytes.size() < kHeader || Read<uint32_t>(bytes, 0) != kMagic) {
    *problem = "not a descriptor";
    return std::nullopt;
  }
  uint32_t count = Read<uint32_t>(bytes, 4);
  if ((bytes.size() - kHeader) / kItem != count || (bytes.size() - kHeader) % kItem != 0) {
    *problem = "descriptor of " + std::to_string(bytes.size()) + " bytes cannot hold " +
               std::to_string(count) + " items";
    return std::nullopt;
  }
  Descriptor descriptor;
  for (size_t i = 0; i < count; ++i) {
    size_t at = kHeader + i * kItem;
    uint32_t key = Read<uint32_t>(bytes, at);
    uint32_t kind = Read<uint32_t>(bytes, at + 4);
    if (kind == kIntegerKind) {
      descriptor.PutInteger(key, static_cast<int32_t>(Read<int64_t>(bytes, at + 8)));
    } else if (kind == kFloatKind) {
      descriptor.PutFloat(key, Read<double>(bytes, at + 8));
    } else {
      *problem = "item " + std::to_string(i) + " has an unknown kind '" + FourCCText(kind) + "'";
      return std::nullopt;
    }
  }
  return descriptor;
}

}  // namespace Standin
