// The tool under faults: a module that crashes or hangs on one page costs
// that page alone, within the page time limit, and a batch killed at any
// point and resumed reports every page exactly once.
#include <signal.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <map>
#include <random>
#include <set>
#include <thread>

#include "cli_fixture.h"

namespace FringeTest {
namespace {

class FaultsTest : public CliTest {
 protected:
  void SetUp() override {
    // The broken module hands healthy pages on to the real one.
    ::setenv("FRINGE_FORWARD_MODULE", FringeModule().c_str(), 1);
  }
  void TearDown() override { ::unsetenv("FRINGE_FORWARD_MODULE"); }

  // A page of the given width, so that the broken module knows what to do.
  std::string Page(const std::string& name, int width) {
    return WritePageFile("in/" + name + ".png", Layout::Rgb, 6.0, true, width, 90);
  }

  static const nlohmann::json* LineFor(const std::vector<nlohmann::json>& lines,
                                       const std::string& file) {
    for (const auto& line : lines) {
      if (line["file"] == file) return &line;
    }
    return nullptr;
  }
};

TEST_F(FaultsTest, AWorkerThatCrashesOrHangsCostsOnlyItsPage) {
  const std::string healthy1 = Page("a", 120), crash = Page("b", 121), hang = Page("c", 123),
                    healthy2 = Page("d", 124);
  std::vector<nlohmann::json> expected;
  for (const std::string& file : {healthy1, healthy2}) {
    const RunOutcome real = RunFringe({"detect", "--json", "--module", FringeModule(), file});
    ASSERT_LE(real.exitCode, 1) << real.err;
    expected.push_back(OnlyLine(real));
  }
  for (const char* jobs : {"1", "2"}) {
    SCOPED_TRACE(std::string("jobs ") + jobs);
    const RunOutcome r = RunFringe({"detect", "--json", "-j", jobs, "--page-timeout", "3",
                                    "--module", BrokenModule(), healthy1, crash, hang, healthy2});
    EXPECT_EQ(r.exitCode, 70) << r.err;
    const auto lines = r.JsonLines();
    ASSERT_EQ(lines.size(), 4u) << r.out << r.err;
    for (size_t k : {0u, 3u}) {
      nlohmann::json line = lines[k], want = expected[k == 0 ? 0 : 1];
      line.erase("times_ms");
      want.erase("times_ms");
      EXPECT_EQ(line, want);
    }
    EXPECT_EQ(lines[1]["file"], crash);
    EXPECT_EQ(lines[1]["status"], "error");
    EXPECT_NE(lines[1]["error"].get<std::string>().find("killed by signal 6"), std::string::npos)
        << lines[1];
    EXPECT_EQ(lines[2]["file"], hang);
    EXPECT_EQ(lines[2]["status"], "error");
    EXPECT_EQ(lines[2]["error_kind"], "internal");
    EXPECT_NE(lines[2]["error"].get<std::string>().find("stopped after 3 s (--page-timeout)"),
              std::string::npos)
        << lines[2];
    EXPECT_NE(r.err.find(crash + ":"), std::string::npos) << r.err;
    EXPECT_NE(r.err.find(hang + ":"), std::string::npos) << r.err;
  }
}

TEST_F(FaultsTest, ASinglePageThatHangsIsStoppedAndReportedInItsResultsFile) {
  const std::string hang = Page("c", 133);
  const std::string results = tmp_ / "results.jsonl";
  const RunOutcome r = RunFringe({"detect", "--json", "--page-timeout", "1", "--results", results,
                                  "--module", BrokenModule(), hang});
  EXPECT_EQ(r.exitCode, 70) << r.err;
  const nlohmann::json line = OnlyLine(r);
  EXPECT_EQ(line["status"], "error");
  EXPECT_NE(line["error"].get<std::string>().find("stopped after 1 s (--page-timeout)"),
            std::string::npos)
      << line;
  EXPECT_NE(r.err.find(hang + ":"), std::string::npos) << r.err;
  EXPECT_EQ(ReadFile(results), r.out);
}

TEST_F(FaultsTest, APageTimeLimitMustBeAWholeNumberOfSecondsFromZero) {
  const std::string page = Page("a", 120);
  for (const char* bad : {"-1", "x", "1.5"}) {
    const RunOutcome r = Fringe({"detect", "--page-timeout", bad, page});
    EXPECT_EQ(r.exitCode, 64) << bad << r.err;
  }
  EXPECT_EQ(Fringe({"detect", "--page-timeout", "0", page}).exitCode, 0);
}

// Kills the coordinator once the results file has grown past a seeded point,
// again and again, until a run gets to the end.
TEST_F(FaultsTest, ABatchKilledAtSeededPointsAndResumedReportsEveryPageOnce) {
  std::set<std::string> pages;
  for (int i = 0; i < 10; ++i) pages.insert(Page("p" + std::to_string(i), 200 + 2 * i));
  const std::string results = tmp_ / "results.jsonl";
  const std::vector<std::string> args = {
      "detect", "--json", "-j", "2", "--module", FringeModule(), "--results", results, tmp_ / "in"};
  std::mt19937 rng(20261206);
  bool completed = false;
  int kills = 0;
  for (int round = 0; round < 15 && !completed; ++round) {
    const auto size = [&] {
      std::error_code ec;
      const auto n = std::filesystem::file_size(results, ec);
      return ec ? 0 : static_cast<long long>(n);
    };
    // Past the current end, so that every round records at least one page.
    const long long killAt = size() + std::uniform_int_distribution<long long>(1, 3000)(rng);
    const int pid = StartFringe(args, tmp_ / "stdout", tmp_ / "stderr");
    for (;;) {
      int status = 0;
      if (::waitpid(pid, &status, WNOHANG) == pid) {
        ASSERT_TRUE(WIFEXITED(status)) << status;
        EXPECT_EQ(WEXITSTATUS(status), 0) << ReadFile(tmp_ / "stderr");
        completed = true;
        break;
      }
      if (size() >= killAt) {
        ::kill(pid, SIGKILL);
        WaitFringe(pid);
        ++kills;
        break;
      }
      std::this_thread::sleep_for(std::chrono::milliseconds(2));
    }
  }
  ASSERT_TRUE(completed);
  EXPECT_GT(kills, 0);

  std::map<std::string, int> reported;
  std::ifstream in(results);
  std::string line;
  while (std::getline(in, line)) {
    const nlohmann::json j = nlohmann::json::parse(line);  // every line whole
    ++reported[j["file"].get<std::string>()];
    EXPECT_NE(j["status"], "error") << line;
  }
  EXPECT_EQ(reported.size(), pages.size());
  for (const std::string& page : pages) EXPECT_EQ(reported[page], 1) << page;
}

}  // namespace
}  // namespace FringeTest
