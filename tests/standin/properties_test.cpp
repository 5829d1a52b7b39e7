// Host properties: simple values, complex values handed over as handles, writes.
#include <gtest/gtest.h>

#include <cstring>

#include "host_fixture.h"
#include "standin/fourcc.h"

namespace {

using Standin::FourCC;
using Properties = ScriptedHostTest;

constexpr uint32_t kSignature = FourCC("9ZKT");

TEST_F(Properties, SimpleValuesAndUnknownKeys) {
  host_.Properties().Set(kSignature, FourCC("UIBR"), 0, {3, std::nullopt});
  host_.BeginRun();
  During(1, [](Scripted::HostSide& side) {
    intptr_t value = -1;
    void* handle = nullptr;
    EXPECT_EQ(side.GetProperty(kSignature, FourCC("UIBR"), 0, &value, &handle), 0);
    EXPECT_EQ(value, 3);
    EXPECT_EQ(handle, nullptr);
    EXPECT_EQ(side.GetProperty(kSignature, FourCC("LGTB"), 0, &value, &handle), 0);
    EXPECT_EQ(value, 0);
    EXPECT_NE(side.GetProperty(kSignature, FourCC("what"), 0, &value, &handle), 0);
    EXPECT_NE(side.GetProperty(FourCC("else"), FourCC("UIBR"), 0, &value, &handle), 0);
    EXPECT_EQ(side.SetProperty(kSignature, FourCC("wtch"), 0, 1), 0);
    EXPECT_EQ(side.GetProperty(kSignature, FourCC("wtch"), 0, &value, &handle), 0);
    EXPECT_EQ(value, 1);
  });
  ASSERT_EQ(host_.Properties().Writes().size(), 1u);
  EXPECT_EQ(host_.Properties().Writes()[0].key, FourCC("wtch"));
}

TEST_F(Properties, ScratchVolumesComeAsWideTextInHandlesTheModuleOwns) {
  host_.Properties().SetScratchVolumes({"/tmp/a", "D:/\xC3\xA9"});
  host_.BeginRun();
  During(2, [](Scripted::HostSide& side) {
    intptr_t count = 0;
    void* handle = nullptr;
    ASSERT_EQ(side.GetProperty(kSignature, FourCC("nusv"), 0, &count, &handle), 0);
    EXPECT_EQ(count, 2);
    ASSERT_EQ(side.GetProperty(kSignature, FourCC("svlp"), 1, &count, &handle), 0);
    ASSERT_NE(handle, nullptr);
    ASSERT_EQ(side.HandleSize(handle), static_cast<int32_t>(5 * sizeof(wchar_t)));
    std::wstring text(4, L'\0');
    std::memcpy(text.data(), side.Lock(handle), 4 * sizeof(wchar_t));
    EXPECT_EQ(text, L"D:/\u00E9");
    side.Unlock(handle);
    side.DisposeHandle(handle);
    side.GetProperty(kSignature, FourCC("svlp"), 0, &count, &handle);  // never released
  });
  host_.CheckRunEnd();
  std::string leak =
      "leaked handle #2 of " + std::to_string(7 * sizeof(wchar_t)) + " bytes, property 'svlp' 0";
  EXPECT_EQ(Problems(), leak + "\n");
}

}  // namespace
