// Expansion of the backslash and caret escapes in the default texts of key
// strings ("^n" a line feed, "^+0025" a percent sign, "\t" a tab, ...).
#pragma once

#include <string>

namespace Vireo {

// Rewrites `text` (UTF-8) with every known escape expanded. Unknown escapes,
// placeholders such as "^0" and an escape character at the very end stay as
// they are.
void UnescapeString(std::string& text);

}  // namespace Vireo
