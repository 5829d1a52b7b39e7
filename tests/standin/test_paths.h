// Paths that CMake hands to the tests, usable under Wine as well (Wine sees the
// Unix root as drive Z:).
#pragma once

#include <string>

inline std::string TestPath(const char* path) {
  std::string text(path);
#ifdef _WIN32
  if (!text.empty() && text[0] == '/') text = "Z:" + text;
#endif
  return text;
}
