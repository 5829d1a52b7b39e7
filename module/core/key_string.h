// Key strings: user-visible texts written as "$$$/Key/Path=Default text",
// resolved only when they are about to be shown.
#pragma once

#include <string>
#include <string_view>

namespace Vireo {

// True when `text` begins with the three dollar signs of a key string.
bool IsKeyString(std::string_view text);

struct KeyStringParts {
  std::string_view key;          // from after "$$$" up to the first '=' (keeps its leading '/')
  std::string_view defaultText;  // everything after that '=', empty without one
};

// Splits a key string; `text` must satisfy IsKeyString and outlive the result.
KeyStringParts SplitKeyString(std::string_view text);

}  // namespace Vireo
