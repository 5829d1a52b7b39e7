// Escape expansion in default texts: the backslash escapes, the whole caret
// table, character codes after "^+", and what passes through untouched.
#include "core/unescape.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace Vireo {
namespace {

std::string Unescaped(std::string text) {
  UnescapeString(text);
  return text;
}

TEST(UnescapeString, ExpandsTheFiveBackslashEscapes) {
  EXPECT_EQ(Unescaped(R"(say \"hi\")"), "say \"hi\"");
  EXPECT_EQ(Unescaped(R"(a\\b)"), "a\\b");
  EXPECT_EQ(Unescaped(R"(1\n2\r3\t4)"), "1\n2\r3\t4");
}

TEST(UnescapeString, KeepsUnknownBackslashEscapesAndATrailingBackslash) {
  EXPECT_EQ(Unescaped(R"(C:\x\y)"), R"(C:\x\y)");
  EXPECT_EQ(Unescaped(R"(end\)"), R"(end\)");
  // The character after an unknown escape is spent: it starts no escape of its own.
  EXPECT_EQ(Unescaped(R"(\^n)"), R"(\^n)");
  EXPECT_EQ(Unescaped(R"(^\n)"), R"(^\n)");
  // A backslash that escapes a backslash leaves nothing to escape the next character.
  EXPECT_EQ(Unescaped(R"(\\n)"), R"(\n)");
}

TEST(UnescapeString, ExpandsEveryEntryOfTheCaretTable) {
  // Expected texts are spelled as UTF-8 bytes.
  const std::vector<std::pair<std::string, std::string>> table = {{"^!", "\xC2\xAC"},
                                                                  {"^\"", "\""},
                                                                  {"^U", "\""},
                                                                  {"^#", "\xE2\x8C\x98"},
                                                                  {"^*", "*"},
                                                                  {"^A", "'"},
                                                                  {"^B", "\xE2\x80\xA2"},
                                                                  {"^C", "\xC2\xA9"},
                                                                  {"^D", "\xC2\xB0"},
                                                                  {"^E", "\xC3\xAA"},
                                                                  {"^F", "/"},
                                                                  {"^I", "\xE2\x88\x86"},
                                                                  {"^L", "\\"},
                                                                  {"^l", "\\"},
                                                                  {"^N", "\r\n"},
                                                                  {"^O", "Control"},
                                                                  {"^o", "control"},
                                                                  {"^P", "Alt"},
                                                                  {"^p", "alt"},
                                                                  {"^Q", "?"},
                                                                  {"^R", "\xC2\xAE"},
                                                                  {"^S", "\xE2\x88\x91"},
                                                                  {"^T", "\xE2\x84\xA2"},
                                                                  {"^V", "|"},
                                                                  {"^[", "\xE2\x80\x9C"},
                                                                  {"^]", "\xE2\x80\x9D"},
                                                                  {"^^", "^"},
                                                                  {"^`", "`"},
                                                                  {"^b", "\b"},
                                                                  {"^e", "\xC3\xA9"},
                                                                  {"^n", "\n"},
                                                                  {"^r", "\r"},
                                                                  {"^t", "\t"},
                                                                  {"^{", "\xE2\x80\x98"},
                                                                  {"^}", "\xE2\x80\x99"}};
  for (const auto& [escape, expected] : table) {
    EXPECT_EQ(Unescaped("<" + escape + ">"), "<" + expected + ">") << escape;
  }
}

TEST(UnescapeString, KeepsPlaceholdersUnknownCaretsAndATrailingCaret) {
  EXPECT_EQ(Unescaped("between ^0 and ^1"), "between ^0 and ^1");
  EXPECT_EQ(Unescaped("^z^9^G"), "^z^9^G");
  EXPECT_EQ(Unescaped("50^"), "50^");
  // "^^" gives a caret that does not escape what follows.
  EXPECT_EQ(Unescaped("^^0"), "^0");
  EXPECT_EQ(Unescaped("^^n"), "^n");
}

TEST(UnescapeString, TurnsCaretPlusAndFourHexDigitsIntoThatCharacter) {
  EXPECT_EQ(Unescaped("^+0025"), "%");
  EXPECT_EQ(Unescaped("^+00e9^+00E9"), "\xC3\xA9\xC3\xA9");
  EXPECT_EQ(Unescaped("^+20AC5"),
            "\xE2\x82\xAC"
            "5");                          // only four digits are read
  EXPECT_EQ(Unescaped("a^+0000b"), "ab");  // code 0 gives nothing
}

TEST(UnescapeString, ReadsShortAndInvalidCharacterCodes) {
  EXPECT_EQ(Unescaped("^+25"), "%");  // the text ends: the value so far is used
  EXPECT_EQ(Unescaped("x^+"), "x");
  EXPECT_EQ(Unescaped("^+zz41"), "A");  // non-digits count as 0 and are consumed
  EXPECT_EQ(Unescaped("^+4z"), "@");    // 0x40
  EXPECT_EQ(Unescaped("^+^n41"), "A");  // an escape inside the digits is consumed too
  // A character of several bytes counts as one.
  EXPECT_EQ(Unescaped("^+\xC3\xA9"
                      "041"),
            "A");
}

TEST(UnescapeString, WritesTheReplacementCharacterForASurrogateHalf) {
  EXPECT_EQ(Unescaped("^+D800"), "\xEF\xBF\xBD");
}

TEST(UnescapeString, PassesOtherTextThroughByteForByte) {
  EXPECT_EQ(Unescaped(""), "");
  EXPECT_EQ(Unescaped("plain text"), "plain text");
  EXPECT_EQ(Unescaped("\xC3\xA9t\xC3\xA9^n\xE2\x82\xAC"), "\xC3\xA9t\xC3\xA9\n\xE2\x82\xAC");
  EXPECT_EQ(Unescaped("Ctrl+Shift+^0"), "Ctrl+Shift+^0");
}

}  // namespace
}  // namespace Vireo
