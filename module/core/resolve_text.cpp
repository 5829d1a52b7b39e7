// Resolving a key string into the text that is shown: its default text.
#include "core/resolve_text.h"

namespace Vireo {

void ResolveText(CText& text) {
  const std::string& bytes = text.Utf8();
  if (bytes.size() < 3 || bytes.compare(0, 3, "$$$") != 0) return;
  const size_t equals = bytes.find('=', 3);
  text = equals == std::string::npos ? CText() : CText::FromUtf8(bytes.substr(equals + 1));
}

}  // namespace Vireo
