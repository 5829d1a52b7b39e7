// Key strings: splitting "$$$/Key/Path=Default text" into its parts.
#include "core/key_string.h"

namespace Vireo {
namespace {
constexpr std::string_view kMarker = "$$$";
}  // namespace

bool IsKeyString(std::string_view text) {
  return text.starts_with(kMarker);
}

KeyStringParts SplitKeyString(std::string_view text) {
  const std::string_view rest = text.substr(kMarker.size());
  const std::size_t equals = rest.find('=');
  if (equals == std::string_view::npos) return {rest, {}};
  return {rest.substr(0, equals), rest.substr(equals + 1)};
}

}  // namespace Vireo
