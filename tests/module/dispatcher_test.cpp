// The dispatcher through the real entry function: which selectors create,
// keep and end the filter object, and what each answers.
#include <gtest/gtest.h>

#include "core/reporter.h"
#include "core/service.h"
#include "host/dispatcher.h"
#include "host/entry_point.h"
#include "host/four_char_code.h"
#include "host/rastrix_filter.h"
#include "host/tile_allocator.h"
#include "support/fake_host.h"
#include "support/test_environment.h"

namespace {

using FringeTest::FakeHost;
using FringeTest::Proc;
using Vireo::CRastrixFilter;
using Vireo::FourCharCode;

// Counts its own destruction, to see the dispatcher uninstall it.
class CountingAllocator : public Vireo::CVirtualAllocator {
 public:
  explicit CountingAllocator(int& destroyed) : destroyed_(destroyed) {}
  ~CountingAllocator() override { ++destroyed_; }
  void* Allocate(uint32_t /*size*/) override { return nullptr; }
  void Free(void* /*block*/) override {}

 private:
  int& destroyed_;
};

class DispatcherTest : public ::testing::Test {
 protected:
  void SetUp() override { host_.SetDocument(20, 20, 1, 1); }
  void TearDown() override {
    // Whatever a test left running ends here, so the next starts clean.
    Call(Vireo::kSelectorFinish);
    EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  }

  int16_t Call(int16_t selector) { return CallWith(selector, &host_.record); }
  int16_t CallWith(int16_t selector, void* record) {
    int16_t result = 77;
    ENTRYPOINT1(selector, record, &host_.dataSlot, &result);
    return result;
  }

  FringeTest::AlertCapture alerts_;
  FakeHost host_;
};

TEST_F(DispatcherTest, SelectorsOutsideTheProtocolAnswerZeroAndCreateNothing) {
  for (const int16_t selector : {int16_t{6}, int16_t{100}, int16_t{-1}, int16_t{-32768}}) {
    EXPECT_EQ(Call(selector), 0) << selector;
    EXPECT_EQ(CRastrixFilter::Current(), nullptr) << selector;
  }
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(DispatcherTest, ContinueWithoutObjectAnswersZeroAndCreatesNothing) {
  EXPECT_EQ(Call(Vireo::kSelectorContinue), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  EXPECT_EQ(host_.abortCalls, 0);
}

TEST_F(DispatcherTest, FinishWithoutObjectStillReleasesServicesAndAllocator) {
  Vireo::CServiceT<Vireo::CReporter>::Get();
  int destroyed = 0;
  Vireo::InstallTileAllocator(new CountingAllocator(destroyed));

  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);
  EXPECT_FALSE(Vireo::CServiceT<Vireo::CReporter>::Exists());
  EXPECT_TRUE(Vireo::NoLiveServices());
  EXPECT_EQ(destroyed, 1);
  EXPECT_EQ(Vireo::InstalledTileAllocator(), nullptr);
}

TEST_F(DispatcherTest, OneObjectLivesFromTheFirstRunSelectorToFinish) {
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  CRastrixFilter* object = CRastrixFilter::Current();
  ASSERT_NE(object, nullptr);
  EXPECT_EQ(object->GetSelector(), 1);
  EXPECT_EQ(Call(Vireo::kSelectorPrepare), 0);
  EXPECT_EQ(CRastrixFilter::Current(), object);
  EXPECT_EQ(object->GetSelector(), 2);
  EXPECT_EQ(Call(Vireo::kSelectorContinue), 0);
  EXPECT_EQ(CRastrixFilter::Current(), object);
  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
}

TEST_F(DispatcherTest, PrepareOrStartArrivingFirstCreateTheObject) {
  EXPECT_EQ(Call(Vireo::kSelectorPrepare), 0);
  EXPECT_NE(CRastrixFilter::Current(), nullptr);
  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);

  EXPECT_EQ(Call(Vireo::kSelectorStart), 0);
  EXPECT_NE(CRastrixFilter::Current(), nullptr);
}

TEST_F(DispatcherTest, CreationReadsInterfacePropertiesAndStartReadsTheStartFlag) {
  host_.SetProperty(FourCharCode("UIBR"), 2);
  host_.SetProperty(FourCharCode("LGTB"), 1);
  host_.SetProperty(FourCharCode("zScW"), 7);
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  const std::vector<uint32_t> atCreation = {FourCharCode("UIBR"), FourCharCode("LGTB")};
  EXPECT_EQ(host_.propertyReads, atCreation);
  CRastrixFilter* object = CRastrixFilter::Current();
  EXPECT_EQ(object->InterfaceBrightness(), 2);
  EXPECT_TRUE(object->LightInterface());
  EXPECT_FALSE(object->HostStartFlag());

  ASSERT_EQ(Call(Vireo::kSelectorStart), 0);
  // The start flag is read first; the memory set-up reads after it.
  ASSERT_GT(host_.propertyReads.size(), atCreation.size());
  EXPECT_EQ(host_.propertyReads[atCreation.size()], FourCharCode("zScW"));
  EXPECT_TRUE(object->HostStartFlag());
}

TEST_F(DispatcherTest, InterfaceBrightnessOutsideItsValuesReadsAsOne) {
  host_.SetProperty(FourCharCode("UIBR"), 5);
  host_.SetProperty(FourCharCode("LGTB"), 2);
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  EXPECT_EQ(CRastrixFilter::Current()->InterfaceBrightness(), 1);
  EXPECT_FALSE(CRastrixFilter::Current()->LightInterface());
  Call(Vireo::kSelectorFinish);

  host_.SetProperty(FourCharCode("UIBR"), 0);
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  EXPECT_EQ(CRastrixFilter::Current()->InterfaceBrightness(), 0);
}

TEST_F(DispatcherTest, AFailingStartEndsTheObjectAndItsRunState) {
  // The failure record of a too-small frame cannot get its handle.
  host_.FailAt(Proc::kNewHandle, 1);
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  int destroyed = 0;
  Vireo::InstallTileAllocator(new CountingAllocator(destroyed));
  Vireo::CServiceT<Vireo::CReporter>::Get();

  EXPECT_EQ(Call(Vireo::kSelectorStart), -108);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  EXPECT_EQ(destroyed, 1);
  EXPECT_TRUE(Vireo::NoLiveServices());
  EXPECT_TRUE(alerts_.Lines().empty());

  // The rest of that run finds no object; a further start makes a new one.
  EXPECT_EQ(Call(Vireo::kSelectorContinue), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  EXPECT_EQ(Call(Vireo::kSelectorStart), 0);
  EXPECT_NE(CRastrixFilter::Current(), nullptr);
}

TEST_F(DispatcherTest, AFailingContinueKeepsTheObjectForFinish) {
  ASSERT_EQ(Call(Vireo::kSelectorStart), 0);
  CRastrixFilter* object = CRastrixFilter::Current();
  host_.cancelFromCall = host_.abortCalls + 1;
  EXPECT_EQ(Call(Vireo::kSelectorContinue), 1);
  EXPECT_EQ(CRastrixFilter::Current(), object);
  host_.descriptor.clear();
  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  EXPECT_TRUE(host_.descriptor.empty());
}

TEST_F(DispatcherTest, AboutHasItsOwnObjectAndLeavesNoneBehind) {
  EXPECT_EQ(CallWith(Vireo::kSelectorAbout, &host_.about), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
}

TEST_F(DispatcherTest, AboutDuringARunEndsTheRunsObject) {
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  ASSERT_NE(CRastrixFilter::Current(), nullptr);
  EXPECT_EQ(CallWith(Vireo::kSelectorAbout, &host_.about), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  // The run goes on without an object, as after a failed selector.
  EXPECT_EQ(Call(Vireo::kSelectorContinue), 0);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
}

TEST_F(DispatcherTest, AMissingRecordAnswersParameterErrorWithoutObjectOrAlert) {
  for (const int16_t selector : {int16_t{0}, int16_t{1}, int16_t{2}, int16_t{3}}) {
    EXPECT_EQ(CallWith(selector, nullptr), -50) << selector;
    EXPECT_EQ(CRastrixFilter::Current(), nullptr) << selector;
  }
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  EXPECT_EQ(CallWith(Vireo::kSelectorContinue, nullptr), -50);
  EXPECT_NE(CRastrixFilter::Current(), nullptr);
  EXPECT_EQ(CallWith(Vireo::kSelectorFinish, nullptr), -50);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(DispatcherTest, AMissingResultWordMakesTheCallDoNothing) {
  ENTRYPOINT1(Vireo::kSelectorParameters, &host_.record, &host_.dataSlot, nullptr);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
  EXPECT_TRUE(host_.propertyReads.empty());
}

TEST_F(DispatcherTest, AFilterIndexWithoutAClassFailsWithoutObject) {
  int16_t result = 77;
  Vireo::RunFilterSelector(Vireo::kSelectorParameters, &host_.record, &host_.dataSlot, &result, 1);
  EXPECT_EQ(result, 1);
  EXPECT_EQ(CRastrixFilter::Current(), nullptr);
}

TEST_F(DispatcherTest, TheDataSlotIsNeverTouched) {
  host_.dataSlot = 0x5A5A;
  for (int16_t selector = 1; selector <= 5; ++selector) Call(selector);
  EXPECT_EQ(host_.dataSlot, 0x5A5A);
}

}  // namespace
