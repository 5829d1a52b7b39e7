// The host suites through which key strings are translated: their names,
// versions and the procedures the module calls, by position (counted from 1)
// in each suite's list of procedure pointers.
#pragma once

#include <cstdint>

namespace Vireo {

// An opaque translated-string object handed out by the dictionary suite.
using HostKeyString = void*;

// "HS KeyString Suite", version 1.
inline constexpr const char* kKeyStringSuiteName = "HS KeyString Suite";
inline constexpr std::int32_t kKeyStringSuiteVersion = 1;
inline constexpr int kKeyStringReleasePosition = 14;
inline constexpr int kKeyStringLengthPosition = 18;
inline constexpr int kKeyStringGetUtf16Position = 19;
using KeyStringReleaseProc = void (*)(HostKeyString object);
// Length in 16-bit units, the terminator included.
using KeyStringLengthProc = std::uint32_t (*)(HostKeyString object);
// Copies the text and its terminator into `buffer` of `units` units; 0 on success.
using KeyStringGetUtf16Proc = std::int32_t (*)(HostKeyString object, std::uint16_t* buffer,
                                               std::uint32_t units, std::uint32_t flags);

// "HS KeyString Dictionary Suite", version 1.
inline constexpr const char* kKeyStringDictionarySuiteName = "HS KeyString Dictionary Suite";
inline constexpr std::int32_t kKeyStringDictionarySuiteVersion = 1;
inline constexpr int kDictionaryLookupPosition = 3;
// Looks a whole key string (NUL-terminated UTF-8) up in the plug-in's
// dictionary; 0 on success with the translation in `out`.
using DictionaryLookupProc = std::int32_t (*)(void* pluginReference, const char* keyString,
                                              HostKeyString* out);

// "Rastrix Utilities Suite for Plug-ins", version 1, and "OS Direct SwiftView
// Suite", version 3: both translate a length-prefixed key string into UTF-16.
inline constexpr const char* kUtilitiesSuiteName = "Rastrix Utilities Suite for Plug-ins";
inline constexpr std::int32_t kUtilitiesSuiteVersion = 1;
inline constexpr int kUtilitiesTranslatePosition = 5;
inline constexpr const char* kSwiftViewSuiteName = "OS Direct SwiftView Suite";
inline constexpr std::int32_t kSwiftViewSuiteVersion = 3;
inline constexpr int kSwiftViewTranslatePosition = 17;
// Writes at most `capacity` units into `buffer`; returns their number, the
// terminator included.
using TranslateKeyProc = std::int32_t (*)(const std::uint8_t* lengthPrefixedKey,
                                          std::int32_t capacity, std::uint16_t* buffer);

}  // namespace Vireo
