// The platform seam and the trace: alert log lines, the trace file's safety,
// the physical-memory override, and the operating-system throw routines.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>
#include <thread>

#include "core/debug_trace.h"
#include "core/main_thread.h"
#include "core/os_throw.h"
#include "core/process.h"
#include "core/system_error.h"
#include "platform/alert_log.h"
#include "platform/platform.h"
#include "support/test_environment.h"

#if !defined(_WIN32)
#include <sys/stat.h>
#include <unistd.h>
#endif

namespace {

namespace Platform = Vireo::Platform;

std::string ReadFile(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  std::stringstream text;
  text << in.rdbuf();
  return text.str();
}

TEST(AlertLogTest, EveryAlertStaysOnOneLine) {
  EXPECT_EQ(Platform::EscapeAlertField("a\nb\r\tc\\d"), "a\\nb\\r\\tc\\\\d");
  FringeTest::AlertCapture alerts;
  Platform::ShowErrorAlert(nullptr, "Error", "Task.\n\nReason.");
  Platform::BeepExclamation();
  const std::vector<std::string> expected = {"ALERT\tError\tTask.\\n\\nReason.", "BEEP"};
  EXPECT_EQ(alerts.Lines(), expected);
}

TEST(PhysicalMemoryTest, OverridesTakeThePlaceOfTheMachine) {
  EXPECT_GT(Platform::TotalPhysicalMemory(), 0u);
  FringeTest::SetEnvironment("FRINGE_PHYSICAL_MEMORY", "17179869184");
  EXPECT_EQ(Platform::TotalPhysicalMemory(), 17179869184u);
  Platform::SetPhysicalMemoryOverride(1024);
  EXPECT_EQ(Platform::TotalPhysicalMemory(), 1024u);
  Platform::SetPhysicalMemoryOverride(0);
  FringeTest::SetEnvironment("FRINGE_PHYSICAL_MEMORY", "lots");
  EXPECT_NE(Platform::TotalPhysicalMemory(), 0u) << "a malformed figure is ignored";
  FringeTest::ClearEnvironment("FRINGE_PHYSICAL_MEMORY");
}

TEST(TraceFileTest, LinesAppendAndTheFirstStartsAfresh) {
  FringeTest::ScratchFolder folder;
  const std::string path = (folder.Path() / "trace.txt").string();
  ASSERT_TRUE(Platform::AppendTraceLine(path, "old\n", false));
  ASSERT_TRUE(Platform::AppendTraceLine(path, "one\n", true));
  ASSERT_TRUE(Platform::AppendTraceLine(path, "two\n", false));
  EXPECT_EQ(ReadFile(path), "one\ntwo\n");
}

#if !defined(_WIN32)
TEST(TraceFileTest, APlantedLinkIsNeverFollowed) {
  FringeTest::ScratchFolder folder;
  const std::filesystem::path target = folder.Path() / "victim.txt";
  const std::filesystem::path trace = folder.Path() / "trace.txt";
  { std::ofstream(target) << "precious\n"; }
  std::filesystem::create_symlink(target, trace);

  EXPECT_FALSE(Platform::AppendTraceLine(trace.string(), "appended\n", false));
  EXPECT_EQ(ReadFile(target), "precious\n");
  // Starting afresh removes the link itself, never its target.
  EXPECT_TRUE(Platform::AppendTraceLine(trace.string(), "fresh\n", true));
  EXPECT_EQ(ReadFile(target), "precious\n");
  EXPECT_FALSE(std::filesystem::is_symlink(trace));
  EXPECT_EQ(ReadFile(trace), "fresh\n");
  struct stat info {};
  ASSERT_EQ(stat(trace.c_str(), &info), 0);
  EXPECT_EQ(info.st_mode & 0777, 0600u);
}

TEST(TraceFileTest, APlantedPipeNeitherBlocksNorReceives) {
  FringeTest::ScratchFolder folder;
  const std::filesystem::path pipe = folder.Path() / "trace.txt";
  ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
  EXPECT_FALSE(Platform::AppendTraceLine(pipe.string(), "line\n", false));
}
#endif

TEST(TraceFileTest, TheTraceLivesInTheSystemsTemporaryPlace) {
  const std::string path = Platform::TraceFilePath(Vireo::kDebugTracePath);
#if defined(_WIN32)
  EXPECT_NE(path.find("DebugLog.txt"), std::string::npos);
  EXPECT_NE(path.find('\\'), std::string::npos);
#else
  EXPECT_EQ(path, "/tmp/DebugLog.txt");
#endif
}

TEST(OSThrowTest, EachRoutineThrowsTheRightNumberOnlyWhenItShould) {
  auto numberOf = [](auto&& call) -> uint32_t {
    try {
      call();
    } catch (const Vireo::CSystemError& error) {
      return error.Number();
    }
    return 0xFFFFFFFF;
  };
  constexpr uint32_t kNone = 0xFFFFFFFF;
  EXPECT_EQ(numberOf([] { Vireo::OSThrow(0); }), kNone);
  EXPECT_EQ(numberOf([] { Vireo::OSThrow(5); }), 5u);
  EXPECT_EQ(numberOf([] { Vireo::OSThrowFalse(true, 6); }), kNone);
  EXPECT_EQ(numberOf([] { Vireo::OSThrowFalse(false, 6); }), 6u);
  EXPECT_EQ(numberOf([] { Vireo::OSThrowZero(1, 7); }), kNone);
  EXPECT_EQ(numberOf([] { Vireo::OSThrowZero(0, 7); }), 7u);
  EXPECT_EQ(numberOf([] { Vireo::OSThrowNull(nullptr); }), 14u);
  int any = 0;
  EXPECT_EQ(numberOf([&] { Vireo::OSThrowNull(&any); }), kNone);
}

TEST(OSThrowTest, TracedRoutinesWriteTheirLineOnTheMainThread) {
  Vireo::SetMainThreadId(Platform::CurrentThreadId());
  const std::string trace = Platform::TraceFilePath(Vireo::kDebugTracePath);
  EXPECT_THROW(Vireo::OSThrow(5, "here.cpp", 41), Vireo::CSystemError);
  const std::string text = ReadFile(trace);
  EXPECT_NE(text.find("Exception thrown: \"CSystemError from OSThrow\".,here.cpp,41\n"),
            std::string::npos)
      << text;
  EXPECT_THROW(Vireo::OSThrowNull(nullptr, "there.cpp", 7), Vireo::CSystemError);
  EXPECT_NE(
      ReadFile(trace).find("Exception thrown: \"CSystemError from OSThrowNull\".,there.cpp,7"),
      std::string::npos);
}

TEST(OSThrowTest, ATraceWithTheThrowFlagRaisesADebugError) {
  Vireo::SetMainThreadId(Platform::CurrentThreadId());
  EXPECT_THROW(Vireo::DebugTrace("Broken", "x.cpp", 3, true), Vireo::CDebugError);
}

TEST(OSThrowTest, TracesFromOtherThreadsTravelToTheMainThread) {
  Vireo::SetMainThreadId(Platform::CurrentThreadId());
  const std::string trace = Platform::TraceFilePath(Vireo::kDebugTracePath);
  Vireo::CProcess process;
  // The trace file outlives test processes: a message of this run's own tells them apart.
  const std::string message = "From worker " + std::to_string(std::random_device{}());
  std::thread([&message] { Vireo::DebugTrace(message.c_str(), "worker.cpp", 99, false); }).join();
  EXPECT_EQ(ReadFile(trace).find(message + ",worker.cpp,99"), std::string::npos);
  process.HandlePendingEvents();
  EXPECT_NE(ReadFile(trace).find(message + ",worker.cpp,99"), std::string::npos);
}

}  // namespace
