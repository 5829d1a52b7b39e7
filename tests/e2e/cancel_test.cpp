// Cancels through the host's abort test at each stage of a run, and the
// continue and finish that follow; an object that survives a cancelled run
// carries its code into the next run.
#include "e2e_support.h"

namespace {

using E2E::FailureRecord;
using E2E::ModuleTest;
using E2E::RecordValues;

constexpr int kWidth = 400, kHeight = 300;

class Cancel : public ModuleTest {
 protected:
  void SetUp() override {
    host_ = MakeHost(E2E::PageDocument(E2E::PhotoPage(kWidth, kHeight, 6.0)));
    // A clean run first: how many abort tests a whole start asks.
    host_->Run();
    startAborts_ = host_->AbortCalls() - 1;  // the last one is continue's
    ASSERT_EQ(RecordValues(*host_)[0][8], 255);
  }

  // Cancels from abort test `call` of the next run (sticky unless said) and
  // runs every selector.
  Standin::RunReport CancelledRun(int32_t call, bool sticky = true) {
    host_->CancelAt(call, sticky);
    Standin::RunReport report = host_->Run({.stopOnFailure = false});
    host_->Faults().Restore(Standin::Proc::Abort);
    return report;
  }

  std::unique_ptr<Standin::Host> host_;
  int32_t startAborts_ = 0;
};

TEST_F(Cancel, StagesAskTheAbortTestOncePerRowOrLine) {
  // Profiles: one per row in each of two passes; edge map: one per processed
  // row; edge points: one per scanned line.
  EXPECT_EQ(startAborts_, 2 * kHeight + (kHeight - 4) + 2 * ((kWidth - 17) + (kHeight - 17)));
}

TEST_F(Cancel, CancelInAnyStageOfStartEndsWithTheFailureRecordAndNoDescriptor) {
  // Profiles' row pass, their column pass, the edge map, the edge point search.
  const int32_t stages[] = {1, kHeight + 1, 2 * kHeight + 1, 2 * kHeight + (kHeight - 4) + 1,
                            startAborts_};
  for (int32_t call : stages) {
    Standin::RunReport report = CancelledRun(call);
    EXPECT_EQ(report.results, (std::array<int16_t, 6>{0, 0, 0, 0, 1, 0})) << "cancel at " << call;
    EXPECT_EQ(RecordValues(*host_),
              (std::vector<std::array<int16_t, 9>>{FailureRecord(kHeight, kWidth)}))
        << "cancel at " << call;
    EXPECT_FALSE(host_->LastDescriptor()) << "cancel at " << call;
    ExpectClean(*host_);
  }
}

TEST_F(Cancel, OneCancelledRowOfTheProfilesStillSpoilsTheRun) {
  // Only the first abort test cancels: the analysis carries on and publishes,
  // but the run counts as cancelled.
  Standin::RunReport report = CancelledRun(1, false);
  EXPECT_EQ(report.results[Standin::kStart], 0);
  EXPECT_EQ(report.results[Standin::kContinue], 1);
  EXPECT_EQ(report.results[Standin::kFinish], 0);
  EXPECT_EQ(RecordValues(*host_).size(), 1u);
  EXPECT_FALSE(host_->LastDescriptor());
  ExpectClean(*host_);
}

TEST_F(Cancel, CancelSeenOnlyByContinueStillWithholdsTheDescriptor) {
  Standin::RunReport report = CancelledRun(startAborts_ + 1);
  EXPECT_EQ(report.results[Standin::kContinue], 1);
  EXPECT_EQ(RecordValues(*host_)[0][8], 255);  // start had finished its work
  EXPECT_FALSE(host_->LastDescriptor());
  ExpectClean(*host_);
}

TEST_F(Cancel, ObjectLeftByACancelledRunCarriesItsCodeIntoTheNext) {
  host_->CancelAt(1);
  Standin::RunReport report = host_->Run();  // a host stops at the failing continue
  host_->Faults().Restore(Standin::Proc::Abort);
  EXPECT_EQ(report.results[Standin::kContinue], 1);
  EXPECT_FALSE(report.called[Standin::kFinish]);

  // The next run reuses that object: no analysis, the failure record, and
  // finish clears the code without writing a descriptor.
  report = host_->Run({.continues = 0});
  EXPECT_EQ(report.results, (std::array<int16_t, 6>{}));
  EXPECT_TRUE(host_->ProgressCalls().empty());
  EXPECT_EQ(RecordValues(*host_),
            (std::vector<std::array<int16_t, 9>>{FailureRecord(kHeight, kWidth)}));
  EXPECT_FALSE(host_->LastDescriptor());

  host_->Run();
  EXPECT_EQ(RecordValues(*host_)[0][8], 255);
  EXPECT_TRUE(host_->LastDescriptor());
  ExpectClean(*host_);
}

}  // namespace
