// Translation of a whole key string through the host's translation suites.
#include "host/key_string_translation.h"

#include <algorithm>
#include <array>
#include <vector>

#include "core/utf8.h"
#include "host/proc_table.h"

namespace Vireo {
namespace {

// A translation of `count` units, the last of them the terminator.
std::string TextOfUnits(const std::uint16_t* units, std::int64_t count) {
  if (count < 2) return {};
  return Utf16ToUtf8(units, static_cast<std::size_t>(count - 1));
}

bool TranslateThroughDictionary(const TranslationSuites& suites, void* pluginReference,
                                std::string& text) {
  const auto lookup = SuiteProc<DictionaryLookupProc>(suites.dictionary, kDictionaryLookupPosition);
  const auto release = SuiteProc<KeyStringReleaseProc>(suites.keyString, kKeyStringReleasePosition);
  const auto length = SuiteProc<KeyStringLengthProc>(suites.keyString, kKeyStringLengthPosition);
  const auto get = SuiteProc<KeyStringGetUtf16Proc>(suites.keyString, kKeyStringGetUtf16Position);
  if (lookup == nullptr || release == nullptr || length == nullptr || get == nullptr) return false;

  HostKeyString object = nullptr;
  if (lookup(pluginReference, text.c_str(), &object) != 0 || object == nullptr) return false;
  bool set = false;
  const std::uint32_t units = length(object);
  if (units < 2) {
    text.clear();
    set = true;
  } else if (units <= kMaxKeyStringUnits) {
    std::vector<std::uint16_t> buffer(units);
    if (get(object, buffer.data(), units, 0) == 0) {
      text = TextOfUnits(buffer.data(), units);
      set = true;
    }
  }
  release(object);
  return set;
}

void TranslateThroughProcedure(TranslateKeyProc translate, std::string& text) {
  // Length byte, at most 255 bytes of the key string, and a terminator for
  // hosts that read up to one.
  std::array<std::uint8_t, 257> key{};
  const std::size_t length = std::min<std::size_t>(text.size(), 255);
  key[0] = static_cast<std::uint8_t>(length);
  std::copy_n(text.begin(), length, key.begin() + 1);
  std::vector<std::uint16_t> buffer(kTranslationBufferUnits);
  const std::int32_t count = translate(key.data(), kTranslationBufferUnits, buffer.data());
  text = TextOfUnits(buffer.data(), std::min(count, kTranslationBufferUnits));
}

}  // namespace

bool TranslateThroughSuites(const TranslationSuites& suites, void* pluginReference,
                            std::string& text) {
  if (suites.keyString != nullptr && suites.dictionary != nullptr) {
    return TranslateThroughDictionary(suites, pluginReference, text);
  }
  if (const auto translate =
          SuiteProc<TranslateKeyProc>(suites.utilities, kUtilitiesTranslatePosition)) {
    TranslateThroughProcedure(translate, text);
    return true;
  }
  if (const auto translate =
          SuiteProc<TranslateKeyProc>(suites.swiftView, kSwiftViewTranslatePosition)) {
    TranslateThroughProcedure(translate, text);
    return true;
  }
  return false;
}

}  // namespace Vireo
