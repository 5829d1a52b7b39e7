// Host suites, the procedure-table rule, properties and the host window,
// through a plug-in object attached to the fake host's record.
#include <gtest/gtest.h>

#include "core/rastrix_error.h"
#include "core/service.h"
#include "host/four_char_code.h"
#include "host/proc_table.h"
#include "host/rastrix_filter.h"
#include "support/fake_host.h"

namespace {

using FringeTest::FakeHost;
using FringeTest::Proc;
using FringeTest::SuiteBytes;
using Vireo::FourCharCode;
using Vireo::SuiteId;

class Plugin : public Vireo::CRastrixFilter {
 public:
  Plugin() : CRastrixFilter(0) {}
};

class HostServicesTest : public ::testing::Test {
 protected:
  HostServicesTest() { host_.SetDocument(10, 10, 1, 1); }
  void TearDown() override { Vireo::ReleaseServices(); }
  FakeHost host_;
};

const std::string kKeyString = "HS KeyString Suite/1";
const std::string kDictionary = "HS KeyString Dictionary Suite/1";

TEST_F(HostServicesTest, WithoutABasicSuiteNothingIsAcquiredOrReleased) {
  host_.record.basicSuite = nullptr;
  {
    Plugin plugin;
    plugin.AttachFilterRecord(&host_.record);
    EXPECT_EQ(plugin.Suite(SuiteId::kKeyString1), nullptr);
    EXPECT_EQ(plugin.Suite(SuiteId::kKeyString1), nullptr);
    EXPECT_EQ(plugin.Suite(SuiteId::kTypeIdentifiers3), nullptr);
  }
  EXPECT_TRUE(host_.suiteAcquisitions.empty());
  EXPECT_TRUE(host_.suiteReleases.empty());
}

TEST_F(HostServicesTest, AFailedAcquisitionIsTriedAgainAndSuccessIsCached) {
  SuiteBytes suite(1);
  host_.OfferSuite("HS KeyString Suite", 1, suite.Data());
  host_.RefuseSuite("HS KeyString Suite", 1);
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  EXPECT_EQ(plugin.Suite(SuiteId::kKeyString1), nullptr);
  EXPECT_EQ(plugin.Suite(SuiteId::kKeyString1), suite.Data());
  EXPECT_EQ(plugin.Suite(SuiteId::kKeyString1), suite.Data());
  const std::vector<std::string> expected = {kKeyString, kKeyString};
  EXPECT_EQ(host_.suiteAcquisitions, expected);
}

TEST_F(HostServicesTest, DestructionReleasesExactlyTheSuitesHeld) {
  SuiteBytes keyString(1);
  SuiteBytes dictionary(1);
  host_.OfferSuite("HS KeyString Suite", 1, keyString.Data());
  host_.OfferSuite("HS KeyString Dictionary Suite", 1, dictionary.Data());
  {
    Plugin plugin;
    plugin.AttachFilterRecord(&host_.record);
    plugin.Suite(SuiteId::kKeyString1);
    plugin.Suite(SuiteId::kKeyStringDictionary1);
    plugin.Suite(SuiteId::kSwiftView3);  // not offered
  }
  const std::vector<std::string> expected = {kKeyString, kDictionary};
  EXPECT_EQ(host_.suiteReleases, expected);
}

TEST_F(HostServicesTest, ReleaseFollowsTheFixedOrderNotTheOrderOfAcquisition) {
  SuiteBytes any(1);
  host_.OfferSuite("Rastrix Buffer Suite for Plug-ins", 1, any.Data());
  host_.OfferSuite("OS Direct SwiftView Suite", 3, any.Data());
  host_.OfferSuite("Rastrix UIHooks Suite for Plug-ins", 4, any.Data());
  host_.OfferSuite("df135115-c769-11d0-8079-00c04fd7ec47", 5, any.Data());
  {
    Plugin plugin;
    plugin.AttachFilterRecord(&host_.record);
    plugin.Suite(SuiteId::kDescriptorBuilder5);
    plugin.Suite(SuiteId::kBuffer1);
    plugin.Suite(SuiteId::kUIHooks4);
    plugin.Suite(SuiteId::kSwiftView3);
  }
  const std::vector<std::string> expected = {
      "OS Direct SwiftView Suite/3", "Rastrix UIHooks Suite for Plug-ins/4",
      "Rastrix Buffer Suite for Plug-ins/1", "df135115-c769-11d0-8079-00c04fd7ec47/5"};
  EXPECT_EQ(host_.suiteReleases, expected);
}

TEST_F(HostServicesTest, ATableTooShortHidesAProcedureThatIsThere) {
  // Position 4 holds a procedure, but the count says three.
  host_.recordProcs.SetCount(3);
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  EXPECT_FALSE(plugin.HasDataRecordProcs());
  EXPECT_EQ(Vireo::TableProc<Vireo::AddDataRecordProc>(host_.record.dataRecordProcs, 4), nullptr);
  EXPECT_NE(Vireo::TableProc<Vireo::DeleteDataRecordProc>(host_.record.dataRecordProcs, 3),
            nullptr);
  // The wrapper gives its neutral result without calling.
  EXPECT_NO_THROW(plugin.AddDataRecord(FourCharCode("fRNG"), nullptr));
  host_.recordProcs.SetCount(-1);
  EXPECT_EQ(plugin.CountDataRecords(FourCharCode("fRNG")), 0);
}

TEST_F(HostServicesTest, MissingProceduresGiveNeutralResults) {
  host_.handleProcs.Remove(3);
  host_.handleProcs.Remove(5);
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  EXPECT_FALSE(plugin.HasHandleProcs());
  void* handle = plugin.NewHostHandle(4);
  EXPECT_EQ(plugin.GetHostHandleSize(handle), 0);
  EXPECT_EQ(plugin.LockHostHandle(handle, false), nullptr);
  plugin.DisposeHostHandle(handle);
  EXPECT_EQ(host_.LiveHandles(), 0u);
  host_.handleProcs.Remove(1);
  EXPECT_THROW(plugin.NewHostHandle(4), Vireo::CRastrixError);
}

TEST_F(HostServicesTest, HandleSizesAndTheSecondDisposeProcedure) {
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  void* handle = plugin.NewHostHandle(18);
  EXPECT_EQ(plugin.GetHostHandleSize(handle), 18);
  plugin.SetHostHandleSize(handle, 40);
  EXPECT_EQ(plugin.GetHostHandleSize(handle), 40);
  try {
    plugin.SetHostHandleSize(handle, -1);
    ADD_FAILURE() << "a refused size must raise the host's code";
  } catch (const Vireo::CRastrixError& error) {
    EXPECT_EQ(error.Code(), -109);
  }
  // Only a table of eight reaches the second dispose procedure.
  host_.handleProcs.Remove(2);
  plugin.ReleaseHostHandle(handle);
  EXPECT_EQ(host_.LiveHandles(), 0u);
  plugin.ReleaseHostHandle(nullptr);
  plugin.DisposeHostHandle(nullptr);
  EXPECT_EQ(host_.doubleDisposals, 0);
}

TEST_F(HostServicesTest, PropertiesNeedTheHandleProceduresAndBothPropertyProcedures) {
  host_.SetProperty(FourCharCode("plip"), 9);
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  intptr_t value = -1;
  EXPECT_TRUE(
      plugin.GetHostProperty(Vireo::kHostPropertySignature, FourCharCode("plip"), 0, value));
  EXPECT_EQ(value, 9);
  EXPECT_FALSE(
      plugin.GetHostProperty(Vireo::kHostPropertySignature, FourCharCode("none"), 0, value));
  EXPECT_EQ(value, 0);

  EXPECT_TRUE(plugin.SetHostProperty(Vireo::kHostPropertySignature, FourCharCode("wtch"), 0, 1));
  EXPECT_TRUE(
      plugin.GetHostProperty(Vireo::kHostPropertySignature, FourCharCode("wtch"), 0, value));
  EXPECT_EQ(value, 1);

  host_.propertyProcs.Remove(2);
  EXPECT_FALSE(plugin.HasPropertyProcs());
  host_.propertyProcs.Set(2, &FakeHost::SetPropertyProc);
  host_.handleProcs.SetCount(6);
  EXPECT_FALSE(plugin.HasPropertyProcs());
  value = -1;
  EXPECT_FALSE(
      plugin.GetHostProperty(Vireo::kHostPropertySignature, FourCharCode("plip"), 0, value));
  EXPECT_EQ(value, 0);
}

TEST_F(HostServicesTest, AFailedStartFlagReadKeepsTheFlag) {
  host_.SetProperty(FourCharCode("zScW"), 1);
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  plugin.ReadHostStartFlag();
  EXPECT_TRUE(plugin.HostStartFlag());
  host_.FailAt(Proc::kGetProperty, 2, -1);
  plugin.ReadHostStartFlag();
  EXPECT_TRUE(plugin.HostStartFlag());
  host_.SetProperty(FourCharCode("zScW"), 0);
  plugin.ReadHostStartFlag();
  EXPECT_FALSE(plugin.HostStartFlag());
}

uint8_t g_window = 0;
void* MainWindow() {
  return &g_window;
}

TEST_F(HostServicesTest, TheHostWindowComesFromThePlatformDataOrTheUIHooksSuite) {
  Plugin plugin;
  plugin.AttachFilterRecord(&host_.record);
  EXPECT_EQ(plugin.HostMainWindow(), nullptr);

  SuiteBytes hooks(11);
  hooks.Set(11, &MainWindow);
  host_.OfferSuite("Rastrix UIHooks Suite for Plug-ins", 4, hooks.Data());
  EXPECT_EQ(plugin.HostMainWindow(), &g_window);

  int platformWindow = 0;
  void* platform[2] = {&platformWindow, nullptr};
  host_.record.platformData = platform;
  EXPECT_EQ(plugin.HostMainWindow(), &platformWindow);
  platform[0] = nullptr;
  EXPECT_EQ(plugin.HostMainWindow(), &g_window);
}

}  // namespace
