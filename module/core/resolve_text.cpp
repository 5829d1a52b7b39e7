// Resolving a text that is about to be shown: key strings go through the
// run's cache, the host's translation or their default text.
#include "core/resolve_text.h"

#include "core/run_key_strings.h"

namespace Vireo {

void ResolveText(CText& text) {
  LocalizeString(text);
}

}  // namespace Vireo
