// Key-string resolution as the framework does it during a run: through the
// run's cache service (CServiceT<CStringTable>) and the current process
// object's host translation.
#pragma once

#include "core/text.h"

namespace Vireo {

// Resolves a key string in place; any other text is left as it is.
void LocalizeString(CText& text);

// Replaces the first "^<index>" in `text` by `value`, resolved first when it is
// a key string; an empty value removes the token.
void ReplacePlaceholder(CText& text, int index, const CText& value);

}  // namespace Vireo
