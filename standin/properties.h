// The host properties a module may ask for, by signature, key and index: a
// simple (pointer-sized) value or a complex one handed over as a new handle.
#pragma once

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <tuple>
#include <vector>

namespace Standin {

struct PropertyValue {
  intptr_t simple = 0;
  std::optional<std::vector<uint8_t>> complex;  // handed to the module as a handle it owns
};

struct PropertyWrite {
  uint32_t signature = 0;
  uint32_t key = 0;
  int32_t index = 0;
  intptr_t simple = 0;
  bool withHandle = false;
};

class PropertyStore {
 public:
  // Answers 'UIBR' 1, 'LGTB' 0, 'zScW' 1, 'tltp' 1 and 'nusv' 0 under '9ZKT'.
  PropertyStore();

  void Set(uint32_t signature, uint32_t key, int32_t index, PropertyValue value);
  void Remove(uint32_t signature, uint32_t key, int32_t index);
  const PropertyValue* Find(uint32_t signature, uint32_t key, int32_t index) const;

  // 'nusv' = the number of paths, 'svlp' index i = path i as a NUL-terminated
  // string of the platform's wide characters.
  void SetScratchVolumes(const std::vector<std::string>& paths);

  // What the module wrote through the set procedure, in order.
  std::vector<PropertyWrite>& Writes() { return writes_; }

 private:
  std::map<std::tuple<uint32_t, uint32_t, int32_t>, PropertyValue> values_;
  std::vector<PropertyWrite> writes_;
};

// `text` (UTF-8) as NUL-terminated wide characters of this platform, in bytes.
std::vector<uint8_t> WideBytes(const std::string& text);

}  // namespace Standin
