// Property values and their defaults.
#include "standin/properties.h"

#include <cstring>

#include "standin/fourcc.h"

namespace Standin {

namespace {
constexpr uint32_t kSignature = FourCC("9ZKT");
}

PropertyStore::PropertyStore() {
  Set(kSignature, FourCC("UIBR"), 0, {1, std::nullopt});
  Set(kSignature, FourCC("LGTB"), 0, {0, std::nullopt});
  Set(kSignature, FourCC("zScW"), 0, {1, std::nullopt});
  Set(kSignature, FourCC("tltp"), 0, {1, std::nullopt});
  Set(kSignature, FourCC("nusv"), 0, {0, std::nullopt});
}

void PropertyStore::Set(uint32_t signature, uint32_t key, int32_t index, PropertyValue value) {
  values_[{signature, key, index}] = std::move(value);
}

void PropertyStore::Remove(uint32_t signature, uint32_t key, int32_t index) {
  values_.erase({signature, key, index});
}

const PropertyValue* PropertyStore::Find(uint32_t signature, uint32_t key, int32_t index) const {
  auto it = values_.find({signature, key, index});
  return it == values_.end() ? nullptr : &it->second;
}

void PropertyStore::SetScratchVolumes(const std::vector<std::string>& paths) {
  for (auto it = values_.begin(); it != values_.end();) {
    bool scratch = std::get<0>(it->first) == kSignature && std::get<1>(it->first) == FourCC("svlp");
    it = scratch ? values_.erase(it) : std::next(it);
  }
  Set(kSignature, FourCC("nusv"), 0, {static_cast<intptr_t>(paths.size()), std::nullopt});
  for (size_t i = 0; i < paths.size(); ++i) {
    Set(kSignature, FourCC("svlp"), static_cast<int32_t>(i), {0, WideBytes(paths[i])});
  }
}

std::vector<uint8_t> WideBytes(const std::string& text) {
  // Decode UTF-8 leniently (a stray byte stands for itself), encode as wchar_t:
  // UTF-16 where wchar_t has 16 bits, UTF-32 otherwise.
  std::vector<wchar_t> wide;
  for (size_t i = 0; i < text.size();) {
    auto byte = static_cast<uint8_t>(text[i]);
    uint32_t code = byte;
    size_t length = 1;
    if (byte >= 0xF0 && i + 3 < text.size()) {
      code = ((byte & 0x07u) << 18) | ((static_cast<uint8_t>(text[i + 1]) & 0x3Fu) << 12) |
             ((static_cast<uint8_t>(text[i + 2]) & 0x3Fu) << 6) |
             (static_cast<uint8_t>(text[i + 3]) & 0x3Fu);
      length = 4;
    } else if (byte >= 0xE0 && i + 2 < text.size()) {
      code = ((byte & 0x0Fu) << 12) | ((static_cast<uint8_t>(text[i + 1]) & 0x3Fu) << 6) |
             (static_cast<uint8_t>(text[i + 2]) & 0x3Fu);
      length = 3;
    } else if (byte >= 0xC0 && i + 1 < text.size()) {
      code = ((byte & 0x1Fu) << 6) | (static_cast<uint8_t>(text[i + 1]) & 0x3Fu);
      length = 2;
    }
    i += length;
    if constexpr (sizeof(wchar_t) == 2) {
      if (code >= 0x10000) {
        code -= 0x10000;
        wide.push_back(static_cast<wchar_t>(0xD800 + (code >> 10)));
        wide.push_back(static_cast<wchar_t>(0xDC00 + (code & 0x3FF)));
        continue;
      }
    }
    wide.push_back(static_cast<wchar_t>(code));
  }
  wide.push_back(L'\0');
  std::vector<uint8_t> bytes(wide.size() * sizeof(wchar_t));
  std::memcpy(bytes.data(), wide.data(), bytes.size());
  return bytes;
}

}  // namespace Standin
