// Cross-checks the resource reader against the system loader: every resource
// the reader finds in the module file is what Windows itself hands out.
#include <gtest/gtest.h>
#include <windows.h>

#include <string>

#include "pe_resources.h"

namespace ResourceTest {
namespace {

std::wstring Widen(const std::string& text) {
  return {text.begin(), text.end()};
}

TEST(WindowsLoader, ServesTheSameBytesAsTheFileReader) {
  const std::vector<Resource> resources = ReadPeResources(ReadFileBytes(FRINGE_MODULE_FILE));
  ASSERT_FALSE(resources.empty());
  HMODULE module = LoadLibraryExW(Widen(FRINGE_MODULE_FILE).c_str(), nullptr,
                                  LOAD_LIBRARY_AS_DATAFILE | LOAD_LIBRARY_AS_IMAGE_RESOURCE);
  ASSERT_NE(module, nullptr) << "error " << GetLastError();
  for (const Resource& r : resources) {
    SCOPED_TRACE(r.type.ToString() + "/" + r.name.ToString());
    const std::wstring typeName = Widen(r.type.name);
    const std::wstring resourceName = Widen(r.name.name);
    const wchar_t* type = r.type.isName ? typeName.c_str() : MAKEINTRESOURCEW(r.type.id);
    const wchar_t* name = r.name.isName ? resourceName.c_str() : MAKEINTRESOURCEW(r.name.id);
    HRSRC found = FindResourceExW(module, type, name, r.language);
    ASSERT_NE(found, nullptr);
    ASSERT_EQ(SizeofResource(module, found), r.data.size());
    HGLOBAL loaded = LoadResource(module, found);
    ASSERT_NE(loaded, nullptr);
    const auto* bytes = static_cast<const std::uint8_t*>(LockResource(loaded));
    ASSERT_NE(bytes, nullptr);
    EXPECT_EQ(Bytes(bytes, bytes + r.data.size()), r.data);
  }
  FreeLibrary(module);
}

}  // namespace
}  // namespace ResourceTest
