// Turns a text that is about to be shown into what the user reads. Every
// user-visible text passes through here, so that translation lives in one place.
#pragma once

#include "core/text.h"

namespace Vireo {

// A key string ("$$$/Key/Path=Default text") becomes its translation or its
// unescaped default text; any other text is left as it is.
void ResolveText(CText& text);

}  // namespace Vireo
