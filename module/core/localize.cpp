// Resolution of key strings and filling of numbered placeholders.
#include "core/localize.h"

#include "core/key_string.h"
#include "core/unescape.h"

namespace Vireo {

void LocalizeString(std::string& text, const KeyStringContext& context) {
  if (!IsKeyString(text)) return;
  const KeyStringParts parts = SplitKeyString(text);
  if (parts.key.empty()) {
    text.clear();
    return;
  }
  const std::string key(parts.key);
  if (const std::string* cached = context.cache.Find(key)) {
    text = *cached;
    return;
  }
  std::string resolved = text;
  if (!context.translate || !context.translate(resolved)) {
    resolved = std::string(parts.defaultText);
    UnescapeString(resolved);
  }
  context.cache.Insert(key, resolved);
  text = std::move(resolved);
}

void ReplacePlaceholder(std::string& text, int index, std::string value,
                        const KeyStringContext& context) {
  std::string token = "^";
  token += std::to_string(index);
  LocalizeString(value, context);
  const std::size_t at = text.find(token);
  if (at != std::string::npos) text.replace(at, token.size(), value);
}

}  // namespace Vireo
