// Expansion of the backslash and caret escapes in default texts.
#include "core/unescape.h"

#include <optional>
#include <string_view>

#include "core/utf8.h"

namespace Vireo {
namespace {

// The text that a caret followed by `c` stands for, when `c` is in the table.
// "^+" (a character code) is handled by the caller.
std::optional<std::string> CaretText(char c) {
  std::string out;
  switch (c) {
    case '!':
      AppendUtf8(out, 0x00AC);
      return out;  // not sign
    case '"':
    case 'U':
      return "\"";
    case '#':
      AppendUtf8(out, 0x2318);
      return out;  // command key
    case '*':
      return "*";
    case 'A':
      return "'";
    case 'B':
      AppendUtf8(out, 0x2022);
      return out;  // bullet
    case 'C':
      AppendUtf8(out, 0x00A9);
      return out;  // copyright
    case 'D':
      AppendUtf8(out, 0x00B0);
      return out;  // degree
    case 'E':
      AppendUtf8(out, 0x00EA);
      return out;  // e circumflex
    case 'F':
      return "/";
    case 'I':
      AppendUtf8(out, 0x2206);
      return out;  // increment
    case 'L':
    case 'l':
      return "\\";
    case 'N':
      return "\r\n";
    case 'O':
      return "Control";
    case 'o':
      return "control";
    case 'P':
      return "Alt";
    case 'p':
      return "alt";
    case 'Q':
      return "?";
    case 'R':
      AppendUtf8(out, 0x00AE);
      return out;  // registered
    case 'S':
      AppendUtf8(out, 0x2211);
      return out;  // summation
    case 'T':
      AppendUtf8(out, 0x2122);
      return out;  // trade mark
    case 'V':
      return "|";
    case '[':
      AppendUtf8(out, 0x201C);
      return out;  // left double quotation mark
    case ']':
      AppendUtf8(out, 0x201D);
      return out;  // right double quotation mark
    case '^':
      return "^";
    case '`':
      return "`";
    case 'b':
      return "\b";
    case 'e':
      AppendUtf8(out, 0x00E9);
      return out;  // e acute
    case 'n':
      return "\n";
    case 'r':
      return "\r";
    case 't':
      return "\t";
    case '{':
      AppendUtf8(out, 0x2018);
      return out;  // left single quotation mark
    case '}':
      AppendUtf8(out, 0x2019);
      return out;  // right single quotation mark
    default:
      return std::nullopt;
  }
}

std::optional<char> BackslashCharacter(char c) {
  switch (c) {
    case '"':
      return '"';
    case '\\':
      return '\\';
    case 'n':
      return '\n';
    case 'r':
      return '\r';
    case 't':
      return '\t';
    default:
      return std::nullopt;
  }
}

int HexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return 0;  // anything else counts as 0
}

// Reads the up to four characters of a "^+" code starting at `position`,
// advancing past every one of them.
char32_t ReadCharacterCode(const std::string& text, std::size_t& position) {
  char32_t code = 0;
  for (int digits = 0; digits < 4 && position < text.size(); ++digits) {
    const std::size_t length = Utf8CharacterLength(text, position);
    const int value = length == 1 ? HexValue(text[position]) : 0;
    code = code * 16 + static_cast<char32_t>(value);
    position += length;
  }
  return code;
}

// An escape character followed by one it does not know stays as it is, and
// both are done with: the second cannot start an escape of its own.
std::size_t CopyUnknownEscape(const std::string& text, std::size_t position, std::string& out) {
  const std::size_t length = 1 + Utf8CharacterLength(text, position + 1);
  out.append(text, position, length);
  return position + length;
}

}  // namespace

void UnescapeString(std::string& text) {
  std::string out;
  out.reserve(text.size());
  std::size_t i = 0;
  while (i < text.size()) {
    const char c = text[i];
    if ((c != '\\' && c != '^') || i + 1 == text.size()) {
      const std::size_t length = Utf8CharacterLength(text, i);
      out.append(text, i, length);
      i += length;
      continue;
    }
    const char next = text[i + 1];
    if (c == '\\') {
      if (const auto replaced = BackslashCharacter(next)) {
        out.push_back(*replaced);
        i += 2;
      } else {
        i = CopyUnknownEscape(text, i, out);
      }
    } else if (next == '+') {
      i += 2;
      const char32_t code = ReadCharacterCode(text, i);
      if (code != 0) AppendUtf8(out, code);
    } else if (const auto replaced = CaretText(next)) {
      out += *replaced;
      i += 2;
    } else {
      i = CopyUnknownEscape(text, i, out);  // placeholders such as "^0" pass through
    }
  }
  text = std::move(out);
}

}  // namespace Vireo
