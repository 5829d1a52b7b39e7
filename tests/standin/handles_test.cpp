// Handle tracking: what a module does with host handles is checked, and every
// misuse shows up as a problem of the run.
#include <gtest/gtest.h>

#include "host_fixture.h"

namespace {

using HandleTracking = ScriptedHostTest;

bool Mentions(const std::vector<std::string>& problems, const std::string& text) {
  for (const std::string& problem : problems) {
    if (problem.find(text) != std::string::npos) return true;
  }
  return false;
}

TEST_F(HandleTracking, CleanUseLeavesNoProblem) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* handle = side.NewHandle(18);
    ASSERT_NE(handle, nullptr);
    EXPECT_EQ(side.HandleSize(handle), 18);
    uint8_t* bytes = side.Lock(handle);
    ASSERT_NE(bytes, nullptr);
    bytes[17] = 9;
    side.Unlock(handle);
    EXPECT_EQ(side.SetHandleSize(handle, 40), 0);
    EXPECT_EQ(side.HandleSize(handle), 40);
    EXPECT_EQ(side.Lock(handle)[17], 9);
    side.Unlock(handle);
    side.DisposeHandle(handle);
    side.ReleaseHandle(side.NewHandle(0));  // the second dispose procedure ends a life too
  });
  host_.CheckRunEnd();
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
}

TEST_F(HandleTracking, LeakIsReportedOnceAtTheEndOfTheRun) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) { side.NewHandle(18); });
  host_.CheckRunEnd();
  ASSERT_EQ(host_.Problems().All().size(), 1u) << Problems();
  EXPECT_NE(Problems().find("leaked handle #1 of 18 bytes"), std::string::npos) << Problems();
  host_.CheckRunEnd();
  EXPECT_EQ(host_.Problems().All().size(), 1u) << Problems();
}

TEST_F(HandleTracking, SecondDisposalIsReported) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* handle = side.NewHandle(4);
    side.DisposeHandle(handle);
    side.DisposeHandle(handle);
  });
  EXPECT_TRUE(Mentions(host_.Problems().All(), "dispose handle of a disposed handle"))
      << Problems();
}

TEST_F(HandleTracking, UseOfForeignOrDeadHandlesIsReportedAndAnsweredNeutrally) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    int local = 0;
    EXPECT_EQ(side.Lock(&local), nullptr);
    EXPECT_EQ(side.HandleSize(&local), 0);
    void* handle = side.NewHandle(4);
    side.DisposeHandle(handle);
    EXPECT_EQ(side.Lock(handle), nullptr);
    EXPECT_NE(side.AddRecord(0x66524E47, handle), 0);
  });
  const auto& problems = host_.Problems().All();
  EXPECT_TRUE(Mentions(problems, "lock handle of a handle the host never gave out")) << Problems();
  EXPECT_TRUE(Mentions(problems, "lock handle of a disposed handle")) << Problems();
  EXPECT_TRUE(Mentions(problems, "add record of a disposed handle")) << Problems();
}

TEST_F(HandleTracking, LockedHandleCannotBeResized) {
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* handle = side.NewHandle(8);
    side.Lock(handle);
    EXPECT_NE(side.SetHandleSize(handle, 100), 0);
    EXPECT_EQ(side.HandleSize(handle), 8);
    side.Unlock(handle);
    side.DisposeHandle(handle);
  });
  EXPECT_TRUE(host_.Problems().Empty()) << Problems();
}

TEST_F(HandleTracking, StoredRecordHandleStaysTheHosts) {
  host_.Doc().Store().Add(0x66524E47, {1, 2, 3});
  host_.BeginRun();
  During(3, [](Scripted::HostSide& side) {
    void* handle = side.GetRecord(0x66524E47, 1);
    ASSERT_NE(handle, nullptr);
    EXPECT_EQ(side.GetRecord(0x66524E47, 1), handle);  // the same handle each time
    EXPECT_EQ(side.Lock(handle)[2], 3);
    side.Unlock(handle);
    side.DisposeHandle(handle);  // not the module's to dispose
  });
  EXPECT_TRUE(Mentions(host_.Problems().All(), "of a handle the host keeps")) << Problems();
  EXPECT_EQ(host_.Records(0x66524E47).size(), 1u);
}

}  // namespace
