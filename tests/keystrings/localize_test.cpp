// Resolution of key strings through the cache, a translator and the default
// text, and the filling of placeholders.
#include "core/localize.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace Vireo {
namespace {

// A stand-in for the host's translation that records what it was asked.
struct FakeHost {
  std::vector<std::string> asked;
  std::string answer;
  bool knows = false;

  KeyStringTranslator Translator() {
    return [this](std::string& text) {
      asked.push_back(text);
      if (knows) text = answer;
      return knows;
    };
  }
};

class Localize : public ::testing::Test {
 protected:
  std::string Resolved(std::string text) {
    LocalizeString(text, Context());
    return text;
  }
  KeyStringContext Context() { return {cache, withHost ? host.Translator() : nullptr}; }

  CStringTable cache;
  FakeHost host;
  bool withHost = false;
};

TEST_F(Localize, ResolvesToTheDefaultTextAndCachesItUnderTheKey) {
  EXPECT_EQ(Resolved("$$$/Vireo/Reporter/Title=Error"), "Error");
  ASSERT_NE(cache.Find("/Vireo/Reporter/Title"), nullptr);
  EXPECT_EQ(*cache.Find("/Vireo/Reporter/Title"), "Error");
  EXPECT_EQ(cache.Size(), 1U);
}

TEST_F(Localize, LeavesTextsThatAreNotKeyStringsAlone) {
  withHost = true;
  host.knows = true;
  host.answer = "translated";
  EXPECT_EQ(Resolved("$$/Vireo/Reporter/Title=Error"), "$$/Vireo/Reporter/Title=Error");
  EXPECT_EQ(Resolved("$$"), "$$");
  EXPECT_EQ(Resolved(""), "");
  EXPECT_EQ(Resolved("Error ^n"), "Error ^n");  // not unescaped either
  EXPECT_TRUE(host.asked.empty());
  EXPECT_EQ(cache.Size(), 0U);
}

TEST_F(Localize, AnEmptyKeyResolvesToTheEmptyTextWithoutAskingAnyone) {
  withHost = true;
  host.knows = true;
  host.answer = "translated";
  EXPECT_EQ(Resolved("$$$=Default"), "");
  EXPECT_EQ(Resolved("$$$"), "");
  EXPECT_TRUE(host.asked.empty());
  EXPECT_EQ(cache.Size(), 0U);
}

TEST_F(Localize, AKeyWithoutDefaultResolvesToTheEmptyText) {
  EXPECT_EQ(Resolved("$$$/Vireo/NoDefault"), "");
  ASSERT_NE(cache.Find("/Vireo/NoDefault"), nullptr);
  // The key ends at the first '=': later ones belong to the default text.
  EXPECT_EQ(Resolved("$$$/Vireo/Sum=a=b"), "a=b");
}

TEST_F(Localize, ExpandsEscapesInTheDefaultText) {
  EXPECT_EQ(Resolved("$$$/Vireo/Two/Lines=first^nsecond"), "first\nsecond");
  EXPECT_EQ(Resolved("$$$/Vireo/ZoomPanel/Percent=50^+0025"), "50%");
}

TEST_F(Localize, KeepsPlaceholdersForTheCallerToFill) {
  std::string text =
      "$$$/Vireo/Alert/OutOfRange/Message=A value between ^0 and ^1 is^rrequired. Closest value "
      "inserted.";
  LocalizeString(text, Context());
  EXPECT_EQ(text, "A value between ^0 and ^1 is\rrequired. Closest value inserted.");
  ReplacePlaceholder(text, 0, "5", Context());
  EXPECT_EQ(text, "A value between 5 and ^1 is\rrequired. Closest value inserted.");
}

TEST_F(Localize, UsesTheHostTranslationAsReturned) {
  withHost = true;
  host.knows = true;
  host.answer = "Fehler^n\\t";
  EXPECT_EQ(Resolved("$$$/Vireo/Reporter/Title=Error"), "Fehler^n\\t");
  ASSERT_EQ(host.asked.size(), 1U);
  EXPECT_EQ(host.asked[0], "$$$/Vireo/Reporter/Title=Error");  // the whole key string
}

TEST_F(Localize, AsksTheHostAtMostOncePerKey) {
  withHost = true;
  host.knows = true;
  host.answer = "Fehler";
  EXPECT_EQ(Resolved("$$$/Vireo/Reporter/Title=Error"), "Fehler");
  host.answer = "changed";
  EXPECT_EQ(Resolved("$$$/Vireo/Reporter/Title=Error"), "Fehler");
  // Another default text under the same key still finds the cached text.
  EXPECT_EQ(Resolved("$$$/Vireo/Reporter/Title=Other"), "Fehler");
  EXPECT_EQ(host.asked.size(), 1U);
}

TEST_F(Localize, CachesTheDefaultWhenTheHostDoesNotKnowTheKey) {
  withHost = true;
  EXPECT_EQ(Resolved("$$$/Vireo/Exception/Task=The operation could not be completed."),
            "The operation could not be completed.");
  host.knows = true;
  host.answer = "late";
  EXPECT_EQ(Resolved("$$$/Vireo/Exception/Task=The operation could not be completed."),
            "The operation could not be completed.");
  EXPECT_EQ(host.asked.size(), 1U);
}

TEST_F(Localize, ReplacesOnlyTheFirstPlaceholderOfTheIndex) {
  std::string text = "^1 and ^1, ^0";
  ReplacePlaceholder(text, 1, "one", Context());
  EXPECT_EQ(text, "one and ^1, ^0");
}

TEST_F(Localize, RemovesThePlaceholderForAnEmptyValue) {
  std::string text = "Ctrl+Shift+^0!";
  ReplacePlaceholder(text, 0, "", Context());
  EXPECT_EQ(text, "Ctrl+Shift+!");
  ReplacePlaceholder(text, 3, "x", Context());  // no token: nothing changes
  EXPECT_EQ(text, "Ctrl+Shift+!");
}

TEST_F(Localize, ResolvesAKeyStringValueButNotTheTextItself) {
  std::string text = "$$$/Vireo/KeyCommand/ModSXC=Ctrl+Shift+^0";
  ReplacePlaceholder(text, 0, "$$$/Vireo/Key/Tab=Tab^+0021", Context());
  EXPECT_EQ(text, "$$$/Vireo/KeyCommand/ModSXC=Ctrl+Shift+Tab!");
  EXPECT_NE(cache.Find("/Vireo/Key/Tab"), nullptr);
  EXPECT_EQ(cache.Find("/Vireo/KeyCommand/ModSXC"), nullptr);
  // A value that resolves to nothing removes the token.
  std::string percent = "^0%";
  ReplacePlaceholder(percent, 0, "$$$=ignored", Context());
  EXPECT_EQ(percent, "%");
}

}  // namespace
}  // namespace Vireo
