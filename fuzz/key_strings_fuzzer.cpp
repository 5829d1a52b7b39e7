// Fuzz target: the key-string routines on arbitrary bytes. Besides running
// clean under the sanitizers, each routine keeps the promises callers rely
// on: unescaping grows a text by a bounded factor and leaves text without escape
// characters alone; resolving the same text twice (the second time from the
// cache) gives the same answer; filling a placeholder leaves a text without
// any "^" alone.
#include <string>

#include "core/localize.h"
#include "core/unescape.h"
#include "fuzz_bytes.h"
#include "fuzz_check.h"

namespace {

void CheckUnescape(const std::string& original) {
  std::string text = original;
  Vireo::UnescapeString(text);
  // The longest expansion ("^O", "Control") is 7 bytes for 2.
  Fuzz::Check(text.size() <= 4 * original.size(), "unescaping more than quadrupled a text");
  if (original.find_first_of("^\\") == std::string::npos) {
    Fuzz::Check(text == original, "unescaping changed a text without escapes");
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  FuzzInput::Bytes in(data, size);
  const uint8_t mode = in.Byte();
  const bool hostKnows = (mode & 1) != 0;
  const bool withHost = (mode & 2) != 0;
  const std::string answer = in.Text(64);
  const int index = in.Range(-1, 12);
  const std::string value = in.Text(64);
  std::string text;
  for (uint8_t b : in.Rest()) text.push_back(static_cast<char>(b));

  CheckUnescape(text);
  CheckUnescape(value);

  Vireo::CStringTable cache;
  int asked = 0;
  Vireo::KeyStringTranslator translate;
  if (withHost) {
    translate = [&](std::string& t) {
      ++asked;
      if (hostKnows) t = answer;
      return hostKnows;
    };
  }
  const Vireo::KeyStringContext context{cache, translate};

  std::string first = text;
  Vireo::LocalizeString(first, context);
  const int askedFirst = asked;
  std::string second = text;
  Vireo::LocalizeString(second, context);
  Fuzz::Check(first == second, "a key string resolved differently the second time");
  Fuzz::Check(asked == askedFirst || askedFirst == 0,
              "a resolved key string was translated again instead of read from the cache");

  std::string filled = text;
  Vireo::ReplacePlaceholder(filled, index, value, context);
  if (text.find('^') == std::string::npos) {
    Fuzz::Check(filled == text, "a placeholder was filled in a text without one");
  }
  return 0;
}
