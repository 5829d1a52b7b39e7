// Translation of a whole key string through whichever of the host's
// translation suites is available.
#pragma once

#include <string>

#include "host/key_string_suites.h"

namespace Vireo {

// Longest translation, in 16-bit units, taken from the KeyString suite; a
// longer one is refused rather than allocated.
inline constexpr std::uint32_t kMaxKeyStringUnits = 65536;
// Buffer of the utilities and SwiftView ways, in 16-bit units.
inline constexpr std::int32_t kTranslationBufferUnits = 4096;

struct TranslationSuites {
  const void* keyString = nullptr;
  const void* dictionary = nullptr;
  const void* utilities = nullptr;
  const void* swiftView = nullptr;
};

// Tries the dictionary and KeyString suites together, else the utilities
// suite, else the SwiftView suite. Returns true when it has set `text` (UTF-8;
// possibly to the empty text).
bool TranslateThroughSuites(const TranslationSuites& suites, void* pluginReference,
                            std::string& text);

}  // namespace Vireo
