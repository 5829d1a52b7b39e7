// Suites through the basic suite: the host's buffer suite with its accounting,
// suites offered by a test, refusal and retry.
#include <gtest/gtest.h>

#include <cstring>

#include "host_fixture.h"

namespace {

using Standin::kBufferSuiteName;

using Suites = ScriptedHostTest;

struct BufferSuite {
  void* (*make)(uint32_t*, uint32_t);
  void (*dispose)(void**);
  uint32_t (*size)(void*);
  uint32_t (*space)();
};

BufferSuite Unpack(const void* suite) {
  BufferSuite procs{};
  std::memcpy(&procs, suite, sizeof procs);
  return procs;
}

TEST_F(Suites, BufferSuiteHandsOutAndCountsBlocks) {
  host_.suiteBufferSpace = 1000;
  host_.BeginRun();
  During(2, [](Scripted::HostSide& side) {
    const void* suite = nullptr;
    ASSERT_EQ(side.AcquireSuite(kBufferSuiteName, 1, &suite), 0);
    BufferSuite procs = Unpack(suite);
    uint32_t size = 600;
    void* first = procs.make(&size, 100);
    ASSERT_NE(first, nullptr);
    EXPECT_EQ(size, 600u);
    EXPECT_EQ(procs.size(first), 600u);
    EXPECT_EQ(procs.space(), 400u);
    size = 600;
    void* second = procs.make(&size, 300);  // only the minimum fits
    ASSERT_NE(second, nullptr);
    EXPECT_EQ(size, 300u);
    size = 600;
    EXPECT_EQ(procs.make(&size, 200), nullptr);
    procs.dispose(&first);
    EXPECT_EQ(first, nullptr);
  });
  host_.CheckRunEnd();
  Standin::BufferUse use = host_.SuiteBuffers();
  EXPECT_EQ(use.made, 2);
  EXPECT_EQ(use.disposed, 1);
  EXPECT_EQ(use.refused, 1);
  EXPECT_NE(Problems().find("1 buffer suite block(s) never disposed"), std::string::npos)
      << Problems();
}

TEST_F(Suites, UnknownSuiteIsRefusedAndAnOfferedOneIsHandedOut) {
  static int calls = 0;
  void (*probe)() = [] { ++calls; };
  void* address = nullptr;
  std::memcpy(&address, &probe, sizeof address);
  host_.Suites().Offer("HS KeyString Suite", 1, {nullptr, address});
  host_.Suites().RefuseAt("HS KeyString Suite", 1, 1);
  host_.BeginRun();
  During(2, [](Scripted::HostSide& side) {
    const void* suite = &side;
    EXPECT_NE(side.AcquireSuite("No Such Suite", 1, &suite), 0);
    EXPECT_EQ(suite, nullptr);
    EXPECT_NE(side.AcquireSuite("HS KeyString Suite", 1, &suite), 0);  // refused once
    ASSERT_EQ(side.AcquireSuite("HS KeyString Suite", 1, &suite), 0);
    void (*second)() = nullptr;
    std::memcpy(&second, static_cast<const uint8_t*>(suite) + 8, sizeof second);
    second();
    EXPECT_EQ(side.ReleaseSuite("HS KeyString Suite", 1), 0);
    EXPECT_NE(side.ReleaseSuite("No Such Suite", 1), 0);
  });
  EXPECT_EQ(calls, 1);
  Standin::SuiteUse use = host_.Suites().Use("HS KeyString Suite", 1);
  EXPECT_EQ(use.acquired, 1);
  EXPECT_EQ(use.refused, 1);
  EXPECT_EQ(use.released, 1);
  EXPECT_EQ(host_.Suites().Requests().size(), 3u);
  EXPECT_NE(Problems().find("\"No Such Suite\" 1, which was never acquired"), std::string::npos)
      << Problems();
}

TEST_F(Suites, RemovedBufferSuiteProcedureIsANullEntry) {
  host_.Faults().Remove(Standin::Proc::SuiteBufferDispose);
  host_.BeginRun();
  During(2, [](Scripted::HostSide& side) {
    const void* suite = nullptr;
    ASSERT_EQ(side.AcquireSuite(kBufferSuiteName, 1, &suite), 0);
    EXPECT_NE(Unpack(suite).make, nullptr);
    EXPECT_EQ(Unpack(suite).dispose, nullptr);
  });
}

}  // namespace
