// Key strings resolved during a run: the plug-in object asks the host's suites
// once, the run's cache asks the host at most once per key, and the error alert
// shows the host's translation.
#include <gtest/gtest.h>

#include <array>
#include <map>
#include <string>
#include <vector>

#include "alert_log.h"
#include "core/error.h"
#include "core/run_key_strings.h"
#include "core/service.h"
#include "core/string_table.h"
#include "fake_host.h"
#include "host/key_string_suites.h"
#include "host/rastrix_filter.h"

namespace Vireo {
namespace {

const std::vector<std::string> kTranslationSuites = {
    "HS KeyString Suite/1", "HS KeyString Dictionary Suite/1", "OS Direct SwiftView Suite/3",
    "Rastrix Utilities Suite for Plug-ins/1"};

// The host's dictionary, reached through the utilities suite.
std::map<std::string, std::string>* g_dictionary = nullptr;
int g_translateCalls = 0;

std::int32_t Translate(const std::uint8_t* key, std::int32_t capacity, std::uint16_t* buffer) {
  ++g_translateCalls;
  const std::string keyString(reinterpret_cast<const char*>(key + 1), key[0]);
  const auto found = g_dictionary->find(keyString);
  if (found == g_dictionary->end()) return 0;  // unknown: the empty text
  std::int32_t count = 0;
  for (const char c : found->second) {
    if (count + 1 < capacity) buffer[count++] = static_cast<std::uint8_t>(c);
  }
  buffer[count++] = 0;
  return count;
}

// A filter whose start fails with a message for the user.
class FailingFilter : public CRastrixFilter {
 public:
  FailingFilter() : CRastrixFilter(0) {}
  bool DoStart() override {
    throw CError::WithReason("$$$/Vireo/Test/Failure=The scan could not be read.");
  }
};

class PluginTranslationTest : public ::testing::Test {
 protected:
  void SetUp() override {
    g_dictionary = &dictionary;
    g_translateCalls = 0;
    utilities[kUtilitiesTranslatePosition - 1] = reinterpret_cast<const void*>(&Translate);
  }
  void TearDown() override {
    ReleaseServices();
    g_dictionary = nullptr;
  }
  void OfferUtilities() {
    host.OfferSuite(kUtilitiesSuiteName, kUtilitiesSuiteVersion, utilities.data());
  }
  std::vector<std::string> TranslationAcquisitions() const {
    std::vector<std::string> asked;
    for (const std::string& entry : host.AcquireLog()) {
      if (entry.find("Buffer") == std::string::npos) asked.push_back(entry);
    }
    return asked;
  }

  HostFake::FakeHost host;
  std::map<std::string, std::string> dictionary = {
      {"$$$/Vireo/Reporter/Title=Error", "Fehler"},
      {"$$$/Vireo/Test/Failure=The scan could not be read.", "Der Scan ist unlesbar.^n"}};
  std::array<const void*, 8> utilities{};
};

TEST_F(PluginTranslationTest, AsksForTheFourSuitesOncePerObjectEvenWhenNoneIsOffered) {
  CRastrixFilter filter(0);
  filter.AttachFilterRecord(&host.Record());
  CText text = "$$$/Vireo/Reporter/Title=Error";
  EXPECT_FALSE(filter.TranslateKeyString(text));
  EXPECT_EQ(TranslationAcquisitions(), kTranslationSuites);
  OfferUtilities();  // too late for this object
  EXPECT_FALSE(filter.TranslateKeyString(text));
  EXPECT_EQ(TranslationAcquisitions(), kTranslationSuites);
  EXPECT_EQ(text.Utf8(), "$$$/Vireo/Reporter/Title=Error");
}

TEST_F(PluginTranslationTest, ReleasesTheSuitesItHeldWhenTheObjectGoes) {
  OfferUtilities();
  {
    CRastrixFilter filter(0);
    filter.AttachFilterRecord(&host.Record());
    CText text = "$$$/Vireo/Reporter/Title=Error";
    ASSERT_TRUE(filter.TranslateKeyString(text));
    EXPECT_EQ(text.Utf8(), "Fehler");
  }
  EXPECT_EQ(host.ReleaseLog(), std::vector<std::string>{"Rastrix Utilities Suite for Plug-ins/1"});
}

TEST_F(PluginTranslationTest, ARunAsksTheHostAtMostOncePerKey) {
  OfferUtilities();
  CRastrixFilter filter(0);
  filter.AttachFilterRecord(&host.Record());
  for (int i = 0; i < 3; ++i) {
    CText title = "$$$/Vireo/Reporter/Title=Error";
    LocalizeString(title);
    EXPECT_EQ(title.Utf8(), "Fehler");
  }
  for (int i = 0; i < 2; ++i) {
    CText unknown = "$$$/Vireo/Unknown=Default";
    LocalizeString(unknown);
    EXPECT_EQ(unknown.Utf8(), "");  // the host answered: its empty text stands
  }
  EXPECT_EQ(g_translateCalls, 2);

  ReleaseServices();  // the run is over: the next one asks again
  CText again = "$$$/Vireo/Reporter/Title=Error";
  LocalizeString(again);
  EXPECT_EQ(g_translateCalls, 3);
}

TEST_F(PluginTranslationTest, WithoutAProcessObjectTheDefaultTextIsUsed) {
  OfferUtilities();
  CText title = "$$$/Vireo/Reporter/Title=Error^+0021";
  LocalizeString(title);
  EXPECT_EQ(title.Utf8(), "Error!");
  EXPECT_EQ(g_translateCalls, 0);
  EXPECT_EQ(CServiceT<CStringTable>::Get().Size(), 1U);
}

TEST_F(PluginTranslationTest, PlaceholderValuesResolveThroughTheHost) {
  OfferUtilities();
  CRastrixFilter filter(0);
  filter.AttachFilterRecord(&host.Record());
  CText message = "^0: ^1";
  ReplacePlaceholder(message, 0, "$$$/Vireo/Reporter/Title=Error");
  ReplacePlaceholder(message, 1, "plain");
  EXPECT_EQ(message.Utf8(), "Fehler: plain");
}

TEST_F(PluginTranslationTest, TheErrorAlertShowsTheHostsTranslationAsReturned) {
  OfferUtilities();
  HostFake::ScopedAlertLog alerts;
  FailingFilter filter;
  intptr_t slot = 0;
  EXPECT_EQ(filter.OnStart(&host.Record(), &slot), 1);
  // The task is empty, so the reason takes its place; "^n" in a translation stays.
  EXPECT_EQ(alerts.Lines(), std::vector<std::string>{"ALERT\tFehler\tDer Scan ist unlesbar.^n"});
}

TEST_F(PluginTranslationTest, TheErrorAlertFallsBackToUnescapedDefaults) {
  HostFake::ScopedAlertLog alerts;
  FailingFilter filter;
  intptr_t slot = 0;
  EXPECT_EQ(filter.OnStart(&host.Record(), &slot), 1);
  EXPECT_EQ(alerts.Lines(), std::vector<std::string>{"ALERT\tError\tThe scan could not be read."});
}

}  // namespace
}  // namespace Vireo
