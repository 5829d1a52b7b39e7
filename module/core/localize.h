// Resolution of key strings: the run's cache first, then the host's
// translation, then the default text with its escapes expanded; and the filling
// of numbered placeholders ("^0", "^1", ...).
#pragma once

#include <functional>
#include <string>

#include "core/string_table.h"

namespace Vireo {

// Asks the host to translate a whole key string in place; true when it did.
using KeyStringTranslator = std::function<bool(std::string&)>;

// Where a resolution looks: the cache it reads and fills, and the host's
// translation when there is a process object to ask (empty otherwise).
struct KeyStringContext {
  CStringTable& cache;
  KeyStringTranslator translate;
};

// Resolves `text` in place when it is a key string; any other text is left as
// it is. A translation is used as returned; a default text is unescaped.
void LocalizeString(std::string& text, const KeyStringContext& context);

// Replaces the first "^<index>" in `text` by `value`, itself resolved first
// when it is a key string; an empty value removes the token. `text` is not
// resolved here.
void ReplacePlaceholder(std::string& text, int index, std::string value,
                        const KeyStringContext& context);

}  // namespace Vireo
