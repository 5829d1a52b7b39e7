// Reads the resources back out of the built Windows module and compares them,
// field by field, with what the host must find.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <set>
#include <string>

#include "byte_reader.h"
#include "expected_resources.h"
#include "pe_resources.h"
#include "version_info.h"

namespace ResourceTest {
namespace {

constexpr std::uint16_t kEnglishUs = 1033;
constexpr std::uint16_t kStringTable = 6;
constexpr std::uint16_t kVersion = 16;
constexpr std::uint16_t kManifest = 24;

ResourceKey Id(std::uint16_t id) {
  return {false, id, {}};
}
ResourceKey Name(std::string name) {
  return {true, 0, std::move(name)};
}

class ModuleResources : public ::testing::Test {
 protected:
  static void SetUpTestSuite() {
    resources_ = new std::vector<Resource>(ReadPeResources(ReadFileBytes(FRINGE_MODULE_FILE)));
  }
  static void TearDownTestSuite() {
    delete resources_;
    resources_ = nullptr;
  }

  static const Resource& Find(const ResourceKey& type, const ResourceKey& name) {
    for (const Resource& r : *resources_) {
      if (r.type == type && r.name == name) return r;
    }
    throw std::runtime_error("no resource " + type.ToString() + "/" + name.ToString());
  }

  static std::vector<Resource>* resources_;
};

std::vector<Resource>* ModuleResources::resources_ = nullptr;

TEST_F(ModuleResources, HoldsExactlyTheListedResourcesAllInEnglishUs) {
  std::set<std::string> found;
  for (const Resource& r : *resources_) {
    EXPECT_EQ(r.language, kEnglishUs) << r.type.ToString() << "/" << r.name.ToString();
    EXPECT_TRUE(found.insert(r.type.ToString() + "/" + r.name.ToString()).second)
        << "twice: " << r.type.ToString() << "/" << r.name.ToString();
  }
  const std::set<std::string> expected = {"PIPL/#16000", "AETE/#128", "KSTR/SHAREDVIREOSTRINGS.TXT",
                                          "#6/#1",       "#6/#63",    "#6/#64",
                                          "#16/#1",      "#24/#2"};
  EXPECT_EQ(found, expected);
}

TEST_F(ModuleResources, PropertyListParsesToElevenPaddedPropertiesInOrder) {
  const Bytes& pipl = Find(Name("PIPL"), Id(16000)).data;
  ASSERT_EQ(pipl.size(), 346U);
  ByteReader reader(pipl);
  EXPECT_EQ(reader.U16(), 1);
  EXPECT_EQ(reader.U32(), 0U);
  const std::uint32_t count = reader.U32();
  ASSERT_EQ(count, 11U);

  const std::vector<ExpectedProperty> expected = ExpectedProperties();
  ASSERT_EQ(expected.size(), count);
  for (const ExpectedProperty& want : expected) {
    SCOPED_TRACE("property '" + want.key + "'");
    EXPECT_EQ(reader.Code(), "9ZKT");
    EXPECT_EQ(reader.Code(), want.key);
    EXPECT_EQ(reader.U32(), 0U);
    const std::uint32_t length = reader.U32();
    EXPECT_EQ(length % 4, 0U);
    EXPECT_EQ(length, want.data.size());
    EXPECT_EQ(reader.Take(length), want.data);
  }
  EXPECT_TRUE(reader.AtEnd());
  EXPECT_EQ(pipl, ExpectedPropertyList());
}

TEST_F(ModuleResources, PropertyListNamesAHiddenFilterWithItsEntryPoint) {
  const Bytes& pipl = Find(Name("PIPL"), Id(16000)).data;
  std::map<std::string, Bytes> byKey;
  ByteReader reader(pipl, 10);
  while (!reader.AtEnd()) {
    reader.Skip(4);
    const std::string key = reader.Code();
    reader.Skip(4);
    byKey[key] = reader.Take(reader.U32());
  }
  ByteReader name(byKey.at("name"));
  EXPECT_EQ(name.PString(), "Fringe");
  ByteReader category(byKey.at("catg"));
  EXPECT_EQ(category.PString(), "**Hidden**");
  ByteReader kind(byKey.at("kind"));
  EXPECT_EQ(kind.Code(), "9ZFM");
  ByteReader entry(byKey.at("8664"));
  EXPECT_EQ(entry.CString(), "ENTRYPOINT1");
  ByteReader version(byKey.at("vers"));
  EXPECT_EQ(version.U32() >> 16, 4U);
  // Grayscale and RGB only.
  EXPECT_EQ(byKey.at("mode"), (Bytes{0x50, 0, 0, 0}));
  ByteReader terminology(byKey.at("hstm"));
  terminology.Skip(4);
  EXPECT_EQ(terminology.Code(), "Fltr");
  EXPECT_EQ(terminology.Code(), "fRNG");
  EXPECT_EQ(terminology.U16(), 128);
  EXPECT_EQ(terminology.CString(), "Fringe0001");
  // Filter cases 4 and 5 (editable transparency) hand the planes over as they are.
  const Bytes& cases = byKey.at("fici");
  ASSERT_EQ(cases.size(), 28U);
  EXPECT_EQ(cases[3 * 4], 1);
  EXPECT_EQ(cases[4 * 4], 1);
  EXPECT_EQ(cases[2 * 4 + 2], 0x0E);
}

TEST_F(ModuleResources, TerminologyDeclaresTheOneEventFieldByField) {
  const Bytes& aete = Find(Name("AETE"), Id(128)).data;
  ByteReader r(aete);
  EXPECT_EQ(r.U16(), 1);
  EXPECT_EQ(r.U8(), 1);  // format major
  EXPECT_EQ(r.U8(), 0);  // format minor
  EXPECT_EQ(r.U16(), 0);
  EXPECT_EQ(r.U16(), 0);
  ASSERT_EQ(r.U16(), 1);  // suites
  EXPECT_EQ(r.PString(), "$$$/AETE/Common/Rastrix=Rastrix");
  EXPECT_EQ(r.PString(), "");
  EXPECT_EQ(r.Code(), "RSTX");
  EXPECT_EQ(r.U16(), 0);
  EXPECT_EQ(r.U16(), 0);
  ASSERT_EQ(r.U16(), 1);  // events
  EXPECT_EQ(r.PString(), "$$$/HaldenPlugin/Fringe/DialogName/Name=Fringe");
  EXPECT_EQ(r.PString(), "");
  EXPECT_EQ(r.Code(), "Fltr");
  EXPECT_EQ(r.Code(), "fRNG");
  EXPECT_EQ(r.Code(), "null");
  EXPECT_EQ(r.PString(), "");
  EXPECT_EQ(r.U16(), 0);
  EXPECT_EQ(r.Code(), "#ImR");
  EXPECT_EQ(r.PString(), "");
  EXPECT_EQ(r.U16(), 0xB000);
  EXPECT_EQ(r.U16(), 0);  // parameters
  EXPECT_EQ(r.U16(), 0);  // classes
  EXPECT_EQ(r.U16(), 0);  // comparison operators
  EXPECT_EQ(r.U16(), 0);  // enumerations
  EXPECT_TRUE(r.AtEnd());
  // The contents add up to 131 bytes.
  EXPECT_EQ(aete.size(), 131U);
  EXPECT_EQ(aete, ExpectedTerminology());
}

TEST_F(ModuleResources, KeyStringDictionaryIsAByteOrderMarkWithoutEntries) {
  EXPECT_EQ(Find(Name("KSTR"), Name("SHAREDVIREOSTRINGS.TXT")).data, (Bytes{0xFE, 0xFF}));
}

TEST_F(ModuleResources, StringTableHoldsQuotedTextsUnderTheListedIdentifiers) {
  std::map<int, std::string> texts;
  for (const std::uint16_t block : {std::uint16_t{1}, std::uint16_t{63}, std::uint16_t{64}}) {
    const Bytes& data = Find(Id(kStringTable), Id(block)).data;
    ByteReader reader(data);
    for (int slot = 0; slot < 16; ++slot) {
      const std::size_t units = reader.U16();
      std::string text;
      for (std::size_t i = 0; i < units; ++i) {
        const std::uint16_t unit = reader.U16();
        ASSERT_LT(unit, 0x80) << "non-ASCII text in block " << block;
        text.push_back(static_cast<char>(unit));
      }
      if (units > 0) texts[(block - 1) * 16 + slot] = text;
    }
    EXPECT_TRUE(reader.AtEnd() || reader.Remaining() < 2) << "block " << block;
  }
  std::set<int> ids;
  for (const auto& [id, text] : texts) ids.insert(id);
  std::set<int> expected = {2, 1000, 1002};
  for (int id = 1004; id <= 1019; ++id) expected.insert(id);
  EXPECT_EQ(ids, expected);

  EXPECT_EQ(texts[2], "\"Fringe Scan\"");
  for (const auto& [id, text] : texts) {
    SCOPED_TRACE(testing::Message() << "string " << id);
    ASSERT_GE(text.size(), 3U);
    EXPECT_EQ(text.front(), '"');
    EXPECT_EQ(text.back(), '"');
    EXPECT_EQ(std::count(text.begin(), text.end(), '"'), 2);
    EXPECT_LE(text.size(), 80U);  // short, plain texts
  }
}

TEST_F(ModuleResources, VersionInformationNamesFringeOneZeroZeroOne) {
  const VersionNode root = ParseVersionInfo(Find(Id(kVersion), Id(1)).data);
  EXPECT_EQ(root.key, "VS_VERSION_INFO");
  ASSERT_EQ(root.value.size(), 52U);
  ByteReader fixed(root.value);
  EXPECT_EQ(fixed.U32(), 0xFEEF04BDU);
  fixed.Skip(4);                        // structure version
  EXPECT_EQ(fixed.U32(), 0x00010000U);  // file version 1.0
  EXPECT_EQ(fixed.U32(), 0x00000001U);  // .0.1
  EXPECT_EQ(fixed.U32(), 0x00010000U);  // product version 1.0
  EXPECT_EQ(fixed.U32(), 0x00000001U);  // .0.1
  EXPECT_EQ(fixed.U32(), 0x3FU);        // flag mask
  EXPECT_EQ(fixed.U32(), 0U);           // flags
  EXPECT_EQ(fixed.U32(), 0x40004U);     // operating system
  EXPECT_EQ(fixed.U32(), 2U);           // a library
  EXPECT_EQ(fixed.U32(), 0U);           // subtype
  EXPECT_EQ(fixed.U32(), 0U);           // date
  EXPECT_EQ(fixed.U32(), 0U);

  const VersionNode& strings = Child(Child(root, "StringFileInfo"), "040904b0");
  std::map<std::string, std::string> values;
  for (const VersionNode& entry : strings.children) {
    EXPECT_TRUE(entry.isText) << entry.key;
    values[entry.key] = entry.text;
  }
  const std::map<std::string, std::string> expected = {
      {"CompanyName", "Halden"},          {"FileDescription", "Fringe"},
      {"FileVersion", "1, 0, 0, 1"},      {"InternalName", "Fringe"},
      {"OriginalFilename", "Fringe.9zf"}, {"ProductName", "Halden Fringe"},
      {"ProductVersion", "1, 0, 0, 1"}};
  EXPECT_EQ(values, expected);

  const VersionNode& translation = Child(Child(root, "VarFileInfo"), "Translation");
  EXPECT_EQ(translation.value, (Bytes{0x09, 0x04, 0xB0, 0x04}));  // 0x0409, code page 1200
}

TEST_F(ModuleResources, ManifestCarriesOnlyTheTrustInformation) {
  const Bytes& data = Find(Id(kManifest), Id(2)).data;
  const std::string text(data.begin(), data.end());
  EXPECT_NE(text.find("<trustInfo"), std::string::npos);
  EXPECT_NE(text.find("<requestedExecutionLevel level=\"asInvoker\" uiAccess=\"false\"/>"),
            std::string::npos);
  EXPECT_EQ(text.find("<dependency"), std::string::npos);
  EXPECT_EQ(text.find("<file"), std::string::npos);
  EXPECT_EQ(text.find("<compatibility"), std::string::npos);
}

}  // namespace
}  // namespace ResourceTest
