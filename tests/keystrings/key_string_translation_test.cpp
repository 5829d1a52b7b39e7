// Translation through the host's suites: the dictionary and KeyString way,
// the utilities and SwiftView ways, and hosts that answer badly.
#include "host/key_string_translation.h"

#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <string>
#include <vector>

namespace Vireo {
namespace {

// What the fake host's procedures answer and what they were given.
struct FakeHost {
  std::int32_t lookupResult = 0;
  bool lookupGivesObject = true;
  std::uint32_t length = 0;
  std::int32_t getResult = 0;
  std::vector<std::uint16_t> translation;  // written by the get and translate procedures
  std::int32_t translateCount = 0;

  std::vector<std::string> lookups;
  void* lookupReference = nullptr;
  int lengthCalls = 0;
  int getCalls = 0;
  std::uint32_t getUnits = 0;
  std::vector<void*> released;
  std::vector<std::string> translateKeys;  // the length-prefixed keys, as received
  std::vector<std::int32_t> capacities;
  std::string via;
};

FakeHost* host = nullptr;
int objectToken = 0;

std::int32_t Lookup(void* reference, const char* keyString, HostKeyString* out) {
  host->lookups.emplace_back(keyString);
  host->lookupReference = reference;
  *out = host->lookupGivesObject ? &objectToken : nullptr;
  return host->lookupResult;
}
std::uint32_t Length(HostKeyString) {
  ++host->lengthCalls;
  return host->length;
}
std::int32_t GetUtf16(HostKeyString, std::uint16_t* buffer, std::uint32_t units, std::uint32_t) {
  ++host->getCalls;
  host->getUnits = units;
  for (std::uint32_t i = 0; i < units && i < host->translation.size(); ++i) {
    buffer[i] = host->translation[i];
  }
  return host->getResult;
}
void Release(HostKeyString object) {
  host->released.push_back(object);
}

std::int32_t Translate(const std::uint8_t* key, std::int32_t capacity, std::uint16_t* buffer) {
  host->translateKeys.emplace_back(reinterpret_cast<const char*>(key + 1), key[0]);
  host->capacities.push_back(capacity);
  for (std::size_t i = 0; i < host->translation.size() && i < static_cast<std::size_t>(capacity);
       ++i) {
    buffer[i] = host->translation[i];
  }
  return host->translateCount;
}
std::int32_t TranslateUtilities(const std::uint8_t* key, std::int32_t capacity,
                                std::uint16_t* buffer) {
  host->via = "utilities";
  return Translate(key, capacity, buffer);
}
std::int32_t TranslateSwiftView(const std::uint8_t* key, std::int32_t capacity,
                                std::uint16_t* buffer) {
  host->via = "swiftview";
  return Translate(key, capacity, buffer);
}

std::vector<std::uint16_t> Units(const std::string& ascii) {
  std::vector<std::uint16_t> units(ascii.begin(), ascii.end());
  units.push_back(0);
  return units;
}

class TranslateThroughSuitesTest : public ::testing::Test {
 protected:
  void SetUp() override {
    host = &fake;
    keyString[kKeyStringReleasePosition - 1] = reinterpret_cast<const void*>(&Release);
    keyString[kKeyStringLengthPosition - 1] = reinterpret_cast<const void*>(&Length);
    keyString[kKeyStringGetUtf16Position - 1] = reinterpret_cast<const void*>(&GetUtf16);
    dictionary[kDictionaryLookupPosition - 1] = reinterpret_cast<const void*>(&Lookup);
    utilities[kUtilitiesTranslatePosition - 1] = reinterpret_cast<const void*>(&TranslateUtilities);
    swiftView[kSwiftViewTranslatePosition - 1] = reinterpret_cast<const void*>(&TranslateSwiftView);
  }
  void TearDown() override { host = nullptr; }

  TranslationSuites All() {
    return {keyString.data(), dictionary.data(), utilities.data(), swiftView.data()};
  }

  FakeHost fake;
  std::array<const void*, 24> keyString{};
  std::array<const void*, 8> dictionary{};
  std::array<const void*, 8> utilities{};
  std::array<const void*, 24> swiftView{};
  int reference = 0;
};

TEST_F(TranslateThroughSuitesTest, DictionaryWayLooksUpTheWholeKeyStringAndReleasesTheObject) {
  fake.translation = Units("Fehler");
  fake.length = 7;
  std::string text = "$$$/Vireo/Reporter/Title=Error";
  EXPECT_TRUE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_EQ(text, "Fehler");
  ASSERT_EQ(fake.lookups.size(), 1U);
  EXPECT_EQ(fake.lookups[0], "$$$/Vireo/Reporter/Title=Error");
  EXPECT_EQ(fake.lookupReference, &reference);
  EXPECT_EQ(fake.getUnits, 7U);
  EXPECT_EQ(fake.released, std::vector<void*>{&objectToken});
  EXPECT_TRUE(fake.via.empty());  // the other ways are not tried
}

TEST_F(TranslateThroughSuitesTest, DictionaryWayConvertsUtf16ToUtf8) {
  fake.translation = {0x00C9, 0x0074, 0xD83D, 0xDE00, 0x20AC, 0};
  fake.length = 6;
  std::string text = "$$$/K=x";
  ASSERT_TRUE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_EQ(text, "\xC3\x89t\xF0\x9F\x98\x80\xE2\x82\xAC");
}

TEST_F(TranslateThroughSuitesTest, DictionaryWayGivesTheEmptyTextBelowTwoUnits) {
  for (const std::uint32_t length : {0U, 1U}) {
    fake = FakeHost{};
    fake.length = length;
    std::string text = "$$$/K=x";
    EXPECT_TRUE(TranslateThroughSuites(All(), &reference, text));
    EXPECT_EQ(text, "");
    EXPECT_EQ(fake.getCalls, 0);
    EXPECT_EQ(fake.released.size(), 1U);
  }
}

TEST_F(TranslateThroughSuitesTest, DictionaryWayFailsWithoutTouchingTheTextWhenTheHostFails) {
  std::string text = "$$$/K=x";
  fake.lookupResult = -1;
  EXPECT_FALSE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_EQ(fake.lengthCalls, 0);
  EXPECT_TRUE(fake.released.empty());

  fake = FakeHost{};
  fake.lookupGivesObject = false;  // success without an object
  EXPECT_FALSE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_EQ(fake.lengthCalls, 0);

  fake = FakeHost{};
  fake.length = 4;
  fake.getResult = 5;
  EXPECT_FALSE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_EQ(fake.released.size(), 1U);
  EXPECT_EQ(text, "$$$/K=x");
}

TEST_F(TranslateThroughSuitesTest, DictionaryWayRefusesAnAbsurdLengthInsteadOfAllocatingIt) {
  fake.length = 0xFFFFFFFFU;
  std::string text = "$$$/K=x";
  EXPECT_FALSE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_EQ(fake.getCalls, 0);
  EXPECT_EQ(fake.released.size(), 1U);
  EXPECT_EQ(text, "$$$/K=x");
}

TEST_F(TranslateThroughSuitesTest, DictionaryWayWithAMissingProcedureFailsWithoutFallingBack) {
  for (const int position :
       {kKeyStringReleasePosition, kKeyStringLengthPosition, kKeyStringGetUtf16Position}) {
    SetUp();
    keyString[position - 1] = nullptr;
    std::string text = "$$$/K=x";
    EXPECT_FALSE(TranslateThroughSuites(All(), &reference, text)) << position;
    EXPECT_TRUE(fake.lookups.empty());
    EXPECT_TRUE(fake.via.empty());
  }
  SetUp();
  dictionary[kDictionaryLookupPosition - 1] = nullptr;
  std::string text = "$$$/K=x";
  EXPECT_FALSE(TranslateThroughSuites(All(), &reference, text));
  EXPECT_TRUE(fake.via.empty());
}

TEST_F(TranslateThroughSuitesTest, UtilitiesWayGetsALengthPrefixedKeyAndA4096UnitBuffer) {
  fake.translation = Units("Fehler");
  fake.translateCount = 7;
  std::string text = "$$$/Vireo/Reporter/Title=Error";
  const TranslationSuites suites{keyString.data(), nullptr, utilities.data(), swiftView.data()};
  EXPECT_TRUE(TranslateThroughSuites(suites, &reference, text));
  EXPECT_EQ(text, "Fehler");
  EXPECT_EQ(fake.via, "utilities");
  ASSERT_EQ(fake.translateKeys.size(), 1U);
  EXPECT_EQ(fake.translateKeys[0], "$$$/Vireo/Reporter/Title=Error");
  EXPECT_EQ(fake.capacities[0], 4096);
}

TEST_F(TranslateThroughSuitesTest, UtilitiesWayCutsACountLargerThanItsBuffer) {
  fake.translation.assign(5000, 'x');
  fake.translateCount = 100000;
  std::string text = "$$$/K=x";
  const TranslationSuites suites{nullptr, nullptr, utilities.data(), nullptr};
  EXPECT_TRUE(TranslateThroughSuites(suites, &reference, text));
  EXPECT_EQ(text, std::string(4095, 'x'));
}

TEST_F(TranslateThroughSuitesTest, UtilitiesWayGivesTheEmptyTextForSmallOrNegativeCounts) {
  const TranslationSuites suites{nullptr, nullptr, utilities.data(), nullptr};
  for (const std::int32_t count : {1, 0, -1, INT32_MIN}) {
    fake.translation = Units("ignored");
    fake.translateCount = count;
    std::string text = "$$$/K=x";
    EXPECT_TRUE(TranslateThroughSuites(suites, &reference, text)) << count;
    EXPECT_EQ(text, "") << count;
  }
}

TEST_F(TranslateThroughSuitesTest, LengthPrefixedCopyOfALongKeyStringStopsAt255Bytes) {
  std::string text = "$$$/" + std::string(296, 'k') + "=x";  // 302 bytes
  fake.translateCount = 0;
  const TranslationSuites suites{nullptr, nullptr, utilities.data(), nullptr};
  EXPECT_TRUE(TranslateThroughSuites(suites, &reference, text));
  ASSERT_EQ(fake.translateKeys.size(), 1U);
  EXPECT_EQ(fake.translateKeys[0], "$$$/" + std::string(251, 'k'));
}

TEST_F(TranslateThroughSuitesTest, SwiftViewWayServesWhenTheUtilitiesSuiteCannot) {
  fake.translation = Units("Abc");
  fake.translateCount = 4;
  utilities[kUtilitiesTranslatePosition - 1] = nullptr;
  std::string text = "$$$/K=x";
  const TranslationSuites suites{nullptr, dictionary.data(), utilities.data(), swiftView.data()};
  EXPECT_TRUE(TranslateThroughSuites(suites, &reference, text));
  EXPECT_EQ(text, "Abc");
  EXPECT_EQ(fake.via, "swiftview");
  EXPECT_TRUE(fake.lookups.empty());  // the dictionary alone is not a way
}

TEST_F(TranslateThroughSuitesTest, NoUsableSuiteLeavesTheTextAlone) {
  std::string text = "$$$/K=x";
  EXPECT_FALSE(TranslateThroughSuites({}, &reference, text));
  swiftView[kSwiftViewTranslatePosition - 1] = nullptr;
  utilities[kUtilitiesTranslatePosition - 1] = nullptr;
  EXPECT_FALSE(TranslateThroughSuites({nullptr, nullptr, utilities.data(), swiftView.data()},
                                      &reference, text));
  EXPECT_EQ(text, "$$$/K=x");
}

}  // namespace
}  // namespace Vireo
