// The selector guards: how each outcome of a handler becomes the host's
// result, what the user is shown, and the flags each guard keeps.
#include <gtest/gtest.h>

#include <functional>
#include <stdexcept>

#include "core/error.h"
#include "core/rastrix_error.h"
#include "core/service.h"
#include "host/rastrix_filter.h"
#include "support/fake_host.h"
#include "support/test_environment.h"

namespace {

using FringeTest::FakeHost;
using Vireo::CRastrixFilter;

// A filter whose handlers do what the test says.
class ScriptedFilter : public CRastrixFilter {
 public:
  ScriptedFilter() : CRastrixFilter(0) {}
  std::function<bool()> start;
  std::function<bool()> prepare;
  std::function<void()> finish;
  int memorySetUps = 0;

  bool DoStart() override { return start ? start() : CRastrixFilter::DoStart(); }
  bool DoPrepare() override { return prepare ? prepare() : CRastrixFilter::DoPrepare(); }
  void DoFinish(Vireo::FilterRecord* record, intptr_t* slot) override {
    if (finish) finish();
    CRastrixFilter::DoFinish(record, slot);
  }
};

class GuardTest : public ::testing::Test {
 protected:
  void SetUp() override { host_.SetDocument(10, 10, 1, 1); }
  void TearDown() override { Vireo::ReleaseServices(); }

  FringeTest::AlertCapture alerts_;
  FakeHost host_;
  ScriptedFilter filter_;
};

TEST_F(GuardTest, AHostCodePassesThroughUnshown) {
  filter_.start = []() -> bool { throw Vireo::CRastrixError(-108); };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), -108);
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(GuardTest, AStandardExceptionIsShownOnceAndAnsweredWithOne) {
  filter_.start = []() -> bool { throw std::runtime_error("not for the user's eyes"); };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  const std::vector<std::string> expected = {"ALERT\tError\tThe operation could not be completed."};
  EXPECT_EQ(alerts_.Lines(), expected);
}

TEST_F(GuardTest, AnythingElseThrownIsShownAsTheDefaultError) {
  filter_.start = []() -> bool { throw 42; };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  const std::vector<std::string> expected = {"ALERT\tError\tThe operation could not be completed."};
  EXPECT_EQ(alerts_.Lines(), expected);
}

TEST_F(GuardTest, AFrameworkErrorShowsItsTaskAndReason) {
  filter_.start = []() -> bool {
    throw Vireo::CError("$$$/Test/Task=Reading the page.", "$$$/Test/Reason=The page is gone.");
  };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  const std::vector<std::string> expected = {
      "ALERT\tError\tReading the page.\\n\\nThe page is gone."};
  EXPECT_EQ(alerts_.Lines(), expected);
}

TEST_F(GuardTest, ASilentAbortShowsNothingAndAQuietOneBeeps) {
  filter_.start = []() -> bool { throw Vireo::CAbort(true, false); };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  EXPECT_TRUE(alerts_.Lines().empty());

  filter_.start = []() -> bool { throw Vireo::CAbort(false, false); };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  EXPECT_EQ(alerts_.Lines(), std::vector<std::string>{"BEEP"});
}

TEST_F(GuardTest, AHandlerAnsweringFalseFailsWithoutMessage) {
  filter_.start = [] { return false; };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  filter_.prepare = [] { return false; };
  EXPECT_EQ(filter_.OnPrepare(&host_.record, &host_.dataSlot), 1);
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(GuardTest, StartFailsWhenTheFilterDoesNotHandleIt) {
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 1);
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(GuardTest, FinishAnswersZeroEvenWhenItsWorkFailedQuietly) {
  bool ran = false;
  filter_.finish = [&] { ran = true; };
  EXPECT_EQ(filter_.OnFinish(&host_.record, &host_.dataSlot), 0);
  EXPECT_TRUE(ran);
}

TEST_F(GuardTest, TheParametersFlagFollowsTheRun) {
  EXPECT_EQ(filter_.OnParameters(&host_.record, &host_.dataSlot), 0);
  EXPECT_EQ(filter_.RunFlags() & Vireo::kParametersServed, Vireo::kParametersServed);
  // An exception leaves it; a handler answering false clears it.
  filter_.start = []() -> bool { throw Vireo::CRastrixError(-108); };
  filter_.OnStart(&host_.record, &host_.dataSlot);
  EXPECT_NE(filter_.RunFlags() & Vireo::kParametersServed, 0u);
  filter_.start = [] { return false; };
  filter_.OnStart(&host_.record, &host_.dataSlot);
  EXPECT_EQ(filter_.RunFlags() & Vireo::kParametersServed, 0u);

  filter_.OnParameters(&host_.record, &host_.dataSlot);
  filter_.OnFinish(&host_.record, &host_.dataSlot);
  EXPECT_EQ(filter_.RunFlags() & Vireo::kParametersServed, 0u);
}

TEST_F(GuardTest, TheDialogIsWantedOnlyAfterParametersAndWhenTheHostAllows) {
  EXPECT_FALSE(filter_.IsDialogWanted());
  filter_.OnParameters(&host_.record, &host_.dataSlot);
  host_.descriptorParameters.playInfo = 1;
  EXPECT_TRUE(filter_.IsDialogWanted());
  host_.descriptorParameters.playInfo = 0;
  EXPECT_FALSE(filter_.IsDialogWanted());
  host_.record.descriptorParameters = nullptr;
  EXPECT_TRUE(filter_.IsDialogWanted());
}

TEST_F(GuardTest, ProcessFlagsMarkWhichKindOfSelectorIsServed) {
  filter_.OnPrepare(&host_.record, &host_.dataSlot);
  EXPECT_EQ(filter_.ProcessFlags() & Vireo::kServingFilterSelector, Vireo::kServingFilterSelector);
  EXPECT_EQ(filter_.OnAbout(&host_.about, &host_.dataSlot), 0);
  EXPECT_EQ(filter_.ProcessFlags() & (Vireo::kServingFilterSelector | Vireo::kServingAbout), 0u);
  EXPECT_EQ(filter_.GetSelector(), 0);
}

TEST_F(GuardTest, GuardsAttachTheRecordAndTheSelector) {
  EXPECT_EQ(filter_.GetSelector(), -1);
  EXPECT_EQ(filter_.GetFilterRecord(), nullptr);
  filter_.OnContinue(&host_.record, &host_.dataSlot);
  EXPECT_EQ(filter_.GetFilterRecord(), &host_.record);
  EXPECT_EQ(filter_.GetSelector(), 4);
}

TEST_F(GuardTest, MemoryIsSetUpOnceAtTheFirstOfPrepareAndStart) {
  EXPECT_FALSE(filter_.MemoryReady());
  filter_.start = [] { return true; };
  EXPECT_EQ(filter_.OnStart(&host_.record, &host_.dataSlot), 0);
  EXPECT_TRUE(filter_.MemoryReady());
  EXPECT_TRUE(filter_.UsesBufferSuite());
}

TEST_F(GuardTest, AccessorsFallBackToTheAboutRecordWithoutAFilterRecord) {
  int platform = 0;
  host_.about.platformData = &platform;
  filter_.OnAbout(&host_.about, &host_.dataSlot);
  EXPECT_EQ(filter_.PlatformData(), &platform);
  EXPECT_EQ(filter_.BasicSuite(), host_.about.basicSuite);
  EXPECT_EQ(filter_.HandleProcs(), nullptr);
  filter_.OnParameters(&host_.record, &host_.dataSlot);
  EXPECT_EQ(filter_.PlatformData(), nullptr);
  EXPECT_EQ(filter_.HandleProcs(), host_.record.handleProcs);
}

}  // namespace
