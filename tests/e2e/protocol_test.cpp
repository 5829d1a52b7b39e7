// The selector protocol through ENTRYPOINT1: which selectors create, keep and
// destroy the filter object, and what the host gets back in each case. Whether
// an object is alive shows in the continue selector: a live object asks the
// abort test, none answers 0 without asking.
#include "e2e_support.h"

namespace {

using E2E::ModuleTest;
using Standin::Proc;

class Protocol : public ModuleTest {
 protected:
  void SetUp() override { host_ = MakeHost(E2E::PageDocument(E2E::PhotoPage(300, 240, 5.0))); }

  // Sends continue and tells whether a live object answered it.
  bool ObjectAlive() {
    int32_t before = host_->AbortCalls();
    host_->Call(Standin::kContinue);
    return host_->AbortCalls() > before;
  }

  std::unique_ptr<Standin::Host> host_;
};

TEST_F(Protocol, SelectorsOutsideTheRangeAnswerZeroAndCreateNothing) {
  host_->BeginRun();
  for (int16_t selector : {6, 100, -1, -32768, 32767}) {
    EXPECT_EQ(host_->Call(selector), 0) << "selector " << selector;
  }
  EXPECT_FALSE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kContinue), 0);
  EXPECT_EQ(host_->Call(Standin::kFinish), 0);
  EXPECT_FALSE(host_->LastDescriptor());
  EXPECT_TRUE(host_->Records(E2E::kRecordType).empty());
  ExpectClean(*host_);
}

TEST_F(Protocol, WholeRunWithoutParametersOrWithoutPrepare) {
  for (Standin::RunPlan plan : {Standin::RunPlan{.parameters = false},
                                Standin::RunPlan{.parameters = false, .prepare = false}}) {
    Standin::RunReport report = host_->Run(plan);
    EXPECT_EQ(report.results, (std::array<int16_t, 6>{}));
    ASSERT_EQ(E2E::RecordValues(*host_).size(), 1u);
    EXPECT_EQ(E2E::RecordValues(*host_)[0][8], 255);
    EXPECT_TRUE(host_->LastDescriptor());
  }
  ExpectClean(*host_);
}

TEST_F(Protocol, ObjectLivesFromParametersToFinish) {
  host_->BeginRun();
  EXPECT_EQ(host_->Call(Standin::kParameters), 0);
  EXPECT_TRUE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kPrepare), 0);
  EXPECT_EQ(host_->Call(Standin::kStart), 0);
  EXPECT_TRUE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kFinish), 0);
  EXPECT_TRUE(host_->LastDescriptor());
  EXPECT_FALSE(ObjectAlive());
  host_->CheckRunEnd();
  ExpectClean(*host_);
}

TEST_F(Protocol, FailingStartTearsTheObjectDownAndTheNextStartBeginsAfresh) {
  host_->Faults().FailAt(Proc::RecordAdd, 1, 1, -1);
  host_->BeginRun();
  EXPECT_EQ(host_->Call(Standin::kPrepare), 0);
  EXPECT_EQ(host_->Call(Standin::kStart), -1);
  EXPECT_FALSE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kFinish), 0);
  EXPECT_FALSE(host_->LastDescriptor());
  EXPECT_EQ(host_->Call(Standin::kStart), 0);
  EXPECT_TRUE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kFinish), 0);
  EXPECT_TRUE(host_->LastDescriptor());
  host_->CheckRunEnd();
  ExpectClean(*host_);
}

TEST_F(Protocol, FailingContinueKeepsTheObjectForFinish) {
  host_->BeginRun();
  EXPECT_EQ(host_->Call(Standin::kStart), 0);
  host_->CancelAt(1);
  EXPECT_EQ(host_->Call(Standin::kContinue), 1);
  EXPECT_TRUE(ObjectAlive());  // and it answers 1 again: the cancel is remembered
  EXPECT_EQ(host_->Call(Standin::kFinish), 0);
  EXPECT_FALSE(host_->LastDescriptor());
  EXPECT_FALSE(ObjectAlive());
  ExpectClean(*host_);
}

TEST_F(Protocol, AboutUsesAnObjectOfItsOwnAndLeavesNoneBehind) {
  host_->BeginRun();
  EXPECT_EQ(host_->Call(Standin::kAbout), 0);
  EXPECT_FALSE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kStart), 0);
  EXPECT_EQ(host_->Call(Standin::kAbout), 0);
  EXPECT_FALSE(ObjectAlive());
  EXPECT_EQ(host_->Call(Standin::kFinish), 0);
  EXPECT_FALSE(host_->LastDescriptor());
  ExpectClean(*host_);
}

TEST_F(Protocol, PrepareAnswersZeroWhateverTheBudget) {
  // The share-out is overwritten by the filter's own claim before prepare returns.
  for (int32_t budget : {0, 1, 3 << 20}) {
    host_->Doc().maxSpace = budget;
    Standin::RunReport report = host_->Run({.start = false, .continues = 0, .finish = false});
    EXPECT_EQ(report.results[Standin::kPrepare], 0) << budget;
    EXPECT_EQ(report.maxSpaceAfterPrepare, 2 * 3 * 300 * 240 + 5 * 300 + 5 * 240) << budget;
    EXPECT_EQ(report.bufferSpaceAfterPrepare, 0) << budget;
    host_->Call(Standin::kFinish);
  }
  ExpectClean(*host_);
}

TEST_F(Protocol, NullRecordGetsAClearCodeAndNoCrash) {
  host_->BeginRun();
  for (int16_t selector : {0, 1, 2, 3, 4, 5}) host_->CallWithRecord(selector, nullptr);
  EXPECT_NE(host_->CallWithRecord(Standin::kStart, nullptr), 0);
  EXPECT_NE(host_->CallWithRecord(Standin::kPrepare, nullptr), 0);
  EXPECT_EQ(host_->CallWithRecord(Standin::kFinish, nullptr), 0);
  EXPECT_FALSE(ObjectAlive());
  ExpectClean(*host_);
}

TEST_F(Protocol, HostCodePassesThroughWithoutAnAlert) {
  host_->Faults().FailAt(Proc::HandleNew, 1);
  Standin::RunReport report = host_->Run();
  EXPECT_EQ(report.results[Standin::kStart], -108);
  EXPECT_FALSE(report.called[Standin::kFinish]);
  EXPECT_TRUE(host_->Records(E2E::kRecordType).empty());
  EXPECT_TRUE(TakeAlerts().empty());
  ExpectClean(*host_);
}

TEST_F(Protocol, ExceptionFromTheHostIsShownOnceAndAnsweredWithOne) {
  host_->Faults().RaiseAt(Proc::Progress, 10);
  Standin::RunReport report = host_->Run();
  EXPECT_EQ(report.results[Standin::kStart], 1);
  EXPECT_EQ(TakeAlerts(),
            (std::vector<std::string>{"ALERT\tError\tThe operation could not be completed."}));
  EXPECT_FALSE(ObjectAlive());
  ExpectClean(*host_);
}

}  // namespace
