// UTF-8 encoding of single characters and of UTF-16 text from the host.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace Vireo {

// The replacement character, written where a code cannot stand in UTF-8 text
// (a lone surrogate half).
inline constexpr char32_t kReplacementCharacter = 0xFFFD;

// Appends the UTF-8 form of `code`; surrogate halves and codes above U+10FFFF
// become the replacement character.
void AppendUtf8(std::string& text, char32_t code);

// Converts `count` UTF-16 units; a surrogate half without its partner becomes
// the replacement character.
std::string Utf16ToUtf8(const std::uint16_t* units, std::size_t count);

// Bytes taken by the UTF-8 character that starts at `position`: 1 for ASCII and
// for any byte that does not start a well-formed sequence.
std::size_t Utf8CharacterLength(const std::string& text, std::size_t position);

}  // namespace Vireo
