// Conversions between the framework's UTF-8 texts and the system's UTF-16.
#pragma once

#include <string>

namespace Vireo::Platform {

std::wstring WideFromUtf8(const std::string& text);
std::string Utf8FromWide(const std::wstring& text);

}  // namespace Vireo::Platform
