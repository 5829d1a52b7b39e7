// Fault injection: call counting and failure schedules, as the module meets them.
#include <gtest/gtest.h>

#include "host_fixture.h"
#include "standin/faults.h"

namespace {

using Standin::FaultPlan;
using Standin::Proc;

std::vector<bool> Failures(FaultPlan& plan, Proc proc, int calls) {
  std::vector<bool> failed;
  for (int i = 0; i < calls; ++i) failed.push_back(plan.Count(proc).has_value());
  return failed;
}

TEST(FaultPlan, FailureScheduleCountsFromWhenItIsSet) {
  FaultPlan plan;
  plan.Count(Proc::HandleNew);
  plan.Count(Proc::HandleNew);
  plan.FailAt(Proc::HandleNew, 2, 2, -7);
  EXPECT_EQ(Failures(plan, Proc::HandleNew, 5),
            (std::vector<bool>{false, true, true, false, false}));
  EXPECT_EQ(plan.Calls(Proc::HandleNew), 7);
  plan.FailAt(Proc::HandleNew, 1, -1, -7);
  EXPECT_EQ(Failures(plan, Proc::HandleNew, 3), (std::vector<bool>{true, true, true}));
  plan.Restore(Proc::HandleNew);
  EXPECT_EQ(Failures(plan, Proc::HandleNew, 2), (std::vector<bool>{false, false}));
}

TEST(FaultPlan, ScheduleSurvivesAResetOfTheCounts) {
  FaultPlan plan;
  plan.FailAt(Proc::RecordAdd, 3, 1, -1);
  EXPECT_FALSE(plan.Count(Proc::RecordAdd));
  plan.ResetCalls();
  EXPECT_EQ(plan.Calls(Proc::RecordAdd), 0);
  EXPECT_FALSE(plan.Count(Proc::RecordAdd));
  EXPECT_EQ(plan.Count(Proc::RecordAdd), -1);
}

using HostFaults = ScriptedHostTest;

TEST_F(HostFaults, FailingProceduresAnswerTheirFailureValue) {
  host_.Faults().FailAt(Proc::HandleNew, 2);
  host_.Faults().FailAt(Proc::RecordAdd, 1, 1, -1234);
  host_.Faults().FailAt(Proc::AdvanceState, 1, 1, -43);
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* first = side.NewHandle(4);
    EXPECT_NE(first, nullptr);
    EXPECT_EQ(side.NewHandle(4), nullptr);
    void* third = side.NewHandle(4);
    EXPECT_NE(third, nullptr);
    EXPECT_EQ(side.AddRecord(0x66524E47, first), -1234);
    EXPECT_EQ(side.AddRecord(0x66524E47, first), 0);
    EXPECT_EQ(side.AdvanceState(), -43);
    side.DisposeHandle(first);
    side.DisposeHandle(third);
  });
  EXPECT_EQ(host_.Calls(Proc::HandleNew), 3);
  EXPECT_EQ(host_.Records(0x66524E47).size(), 1u);
  EXPECT_EQ(host_.Input(), nullptr);
  host_.CheckRunEnd();
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
}

TEST_F(HostFaults, ScriptedCancelAnswersFromItsCallOn) {
  host_.BeginRun();
  std::vector<int> answers;
  host_.CancelAt(3);
  During(3, [&](Scripted::HostSide& side) {
    for (int i = 0; i < 5; ++i) answers.push_back(side.Abort());
  });
  EXPECT_EQ(answers, (std::vector<int>{0, 0, 1, 1, 1}));
  answers.clear();
  host_.CancelAt(2, false);
  During(4, [&](Scripted::HostSide& side) {
    for (int i = 0; i < 4; ++i) answers.push_back(side.Abort());
  });
  EXPECT_EQ(answers, (std::vector<int>{0, 1, 0, 0}));
  EXPECT_EQ(host_.AbortCalls(), 9);
}

TEST_F(HostFaults, ProgressAndEventsAreRecordedInOrder) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    side.Progress(1, 10);
    side.Progress(2, 10);
    side.DisposeHandle(side.NewHandle(6));
  });
  EXPECT_EQ(host_.ProgressCalls(), (std::vector<std::pair<int32_t, int32_t>>{{1, 10}, {2, 10}}));
  ASSERT_EQ(host_.Events().size(), 2u);
  EXPECT_EQ(host_.Events()[0].proc, Proc::HandleNew);
  EXPECT_EQ(host_.Events()[0].value, 6);
  EXPECT_EQ(host_.Events()[1].proc, Proc::HandleDispose);
  EXPECT_EQ(host_.Events()[1].handle, 1u);
}

TEST_F(HostFaults, RunStopsAtAFailingSelectorLikeAHost) {
  Scripted::SetScript([](int16_t selector, uint8_t*, int16_t* result) {
    if (selector == 4) *result = 1;
  });
  Standin::RunReport report = host_.Run({.continues = 3});
  EXPECT_TRUE(report.called[3]);
  EXPECT_TRUE(report.called[4]);
  EXPECT_EQ(report.results[4], 1);
  EXPECT_FALSE(report.called[5]);
  report = host_.Run({.continues = 2, .stopOnFailure = false});
  EXPECT_TRUE(report.called[5]);
}

}  // namespace
