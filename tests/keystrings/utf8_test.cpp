// UTF-8 from single codes and from the host's UTF-16 text.
#include "core/utf8.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

namespace Vireo {
namespace {

std::string FromUtf16(const std::vector<std::uint16_t>& units) {
  return Utf16ToUtf8(units.data(), units.size());
}

TEST(Utf8, EncodesEachLengthClassAtItsEdges) {
  const std::vector<std::pair<char32_t, std::string>> cases = {{0x41, "A"},
                                                               {0x7F, "\x7F"},
                                                               {0x80, "\xC2\x80"},
                                                               {0x7FF, "\xDF\xBF"},
                                                               {0x800, "\xE0\xA0\x80"},
                                                               {0xFFFF, "\xEF\xBF\xBF"},
                                                               {0x10000, "\xF0\x90\x80\x80"},
                                                               {0x10FFFF, "\xF4\x8F\xBF\xBF"},
                                                               {0x110000, "\xEF\xBF\xBD"},
                                                               {0xDC00, "\xEF\xBF\xBD"}};
  for (const auto& [code, bytes] : cases) {
    std::string text;
    AppendUtf8(text, code);
    EXPECT_EQ(text, bytes) << static_cast<std::uint32_t>(code);
  }
}

TEST(Utf8, JoinsSurrogatePairsAndReplacesLoneHalves) {
  EXPECT_EQ(FromUtf16({0x46, 0x65, 0x68, 0x6C, 0x65, 0x72}), "Fehler");
  EXPECT_EQ(FromUtf16({0xD83D, 0xDE00}), "\xF0\x9F\x98\x80");
  EXPECT_EQ(FromUtf16({0xD83D, 0x41}),
            "\xEF\xBF\xBD"
            "A");
  EXPECT_EQ(FromUtf16({0xDE00, 0xD83D}), "\xEF\xBF\xBD\xEF\xBF\xBD");
  EXPECT_EQ(FromUtf16({0xD83D}), "\xEF\xBF\xBD");  // a high half at the very end
  EXPECT_EQ(FromUtf16({}), "");
}

TEST(Utf8, MeasuresWellFormedCharactersAndTreatsBrokenOnesAsSingleBytes) {
  const std::string text = "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80";
  EXPECT_EQ(Utf8CharacterLength(text, 0), 1U);
  EXPECT_EQ(Utf8CharacterLength(text, 1), 2U);
  EXPECT_EQ(Utf8CharacterLength(text, 3), 3U);
  EXPECT_EQ(Utf8CharacterLength(text, 6), 4U);
  EXPECT_EQ(Utf8CharacterLength("\xE2\x82", 0), 1U);  // cut short
  EXPECT_EQ(Utf8CharacterLength("\xC3"
                                "A",
                                0),
            1U);                                  // no continuation byte
  EXPECT_EQ(Utf8CharacterLength("\x80", 0), 1U);  // a stray continuation byte
}

}  // namespace
}  // namespace Vireo
