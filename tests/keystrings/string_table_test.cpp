// The key-string cache: its bucket function and its chained entries.
#include "core/string_table.h"

#include <gtest/gtest.h>

#include <string>

namespace Vireo {
namespace {

TEST(CStringTable, BucketFollowsTheShiftOrModuloRuleOverUnsignedBytes) {
  EXPECT_EQ(CStringTable::BucketOf(""), 0U);
  EXPECT_EQ(CStringTable::BucketOf("a"), 97U);
  EXPECT_EQ(CStringTable::BucketOf("ab"), 426U);        // (97 * 256 + 98) mod 1021
  EXPECT_EQ(CStringTable::BucketOf("\xFF\xFF"), 191U);  // 65535 mod 1021
  EXPECT_EQ(CStringTable::BucketOf("abc"), 929U);       // (426 * 256 + 99) mod 1021
}

TEST(CStringTable, KeepsKeysOfOneBucketApart) {
  const std::string a = "a";
  const std::string nulA("\0a", 2);  // same bucket, different length
  ASSERT_EQ(CStringTable::BucketOf(a), CStringTable::BucketOf(nulA));
  CStringTable table;
  table.Insert(a, "first");
  EXPECT_EQ(table.Find(nulA), nullptr);
  table.Insert(nulA, "second");
  ASSERT_NE(table.Find(a), nullptr);
  ASSERT_NE(table.Find(nulA), nullptr);
  EXPECT_EQ(*table.Find(a), "first");
  EXPECT_EQ(*table.Find(nulA), "second");
  EXPECT_EQ(table.Find("b"), nullptr);
  EXPECT_EQ(table.Size(), 2U);
}

TEST(CStringTable, ReplacesTheTextOfAKeyEnteredAgain) {
  CStringTable table;
  table.Insert("/Vireo/Reporter/Title", "Error");
  table.Insert("/Vireo/Reporter/Title", "Fehler");
  EXPECT_EQ(table.Size(), 1U);
  EXPECT_EQ(*table.Find("/Vireo/Reporter/Title"), "Fehler");
}

TEST(CStringTable, FindsEveryOneOfManyKeys) {
  CStringTable table;
  for (int i = 0; i < 5000; ++i) table.Insert("/Key/" + std::to_string(i), std::to_string(i * 7));
  EXPECT_EQ(table.Size(), 5000U);
  for (int i = 0; i < 5000; ++i) {
    const std::string* text = table.Find("/Key/" + std::to_string(i));
    ASSERT_NE(text, nullptr) << i;
    EXPECT_EQ(*text, std::to_string(i * 7));
  }
}

}  // namespace
}  // namespace Vireo
