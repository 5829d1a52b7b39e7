// A scripting descriptor as the host builds it from a module's puts: keys in the
// order put, each with a typed value. It travels back to the host as the bytes
// of a host handle and is read back from them.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>
#include <vector>

namespace Standin {

struct DescriptorItem {
  uint32_t key = 0;
  std::variant<int32_t, double> value;
};

class Descriptor {
 public:
  void PutInteger(uint32_t key, int32_t value) { items_.push_back({key, value}); }
  void PutFloat(uint32_t key, double value) { items_.push_back({key, value}); }

  const std::vector<DescriptorItem>& Items() const { return items_; }
  std::vector<uint32_t> Keys() const;
  // The last value put under `key`, when it is of that kind.
  std::optional<int32_t> Integer(uint32_t key) const;
  std::optional<double> Float(uint32_t key) const;

  // Handle contents: 'DESC', item count, then per item the key, the kind
  // ('long' or 'doub') and 8 value bytes; native byte order.
  std::vector<uint8_t> Serialize() const;
  // Null with a reason when the bytes are not a descriptor.
  static std::optional<Descriptor> Parse(const std::vector<uint8_t>& bytes, std::string* problem);

 private:
  const DescriptorItem* Last(uint32_t key) const;
  std::vector<DescriptorItem> items_;
};

}  // namespace Standin
