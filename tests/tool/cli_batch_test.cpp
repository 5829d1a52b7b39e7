// Batches: parallel and one-at-a-time runs agree, progress and summary, and
// an interrupted batch resumes where it stopped without losing or repeating
// a page.
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <map>
#include <thread>

#include "cli_fixture.h"

namespace FringeTest {
namespace {

class BatchTest : public CliTest {
 protected:
  // A folder of pages: photos at several angles and layouts, a blank page and
  // a broken file.
  void MakeFolder(int photos) {
    for (int i = 0; i < photos; ++i) {
      const Layout layout = i % 3 == 0 ? Layout::Gray : Layout::Rgb;
      WritePageFile("in/p" + std::to_string(10 + i) + (i % 2 ? ".jpg" : ".png"), layout,
                    -20.0 + 7.0 * i);
    }
    WritePageFile("in/sub/blank.png", Layout::Rgb, 0.0, false);
    std::ofstream(tmp_ / "in/sub/broken.png") << "not a png";
  }

  // JSON lines without the timings, which differ from run to run.
  static std::vector<nlohmann::json> Results(const std::vector<nlohmann::json>& lines) {
    std::vector<nlohmann::json> out;
    for (nlohmann::json j : lines) {
      j.erase("times_ms");
      out.push_back(j);
    }
    return out;
  }

  static std::vector<nlohmann::json> ReadLines(const std::string& path, bool skipBad = false) {
    std::vector<nlohmann::json> lines;
    std::ifstream in(path);
    std::string line;
    while (std::getline(in, line)) {
      if (line.empty()) continue;
      try {
        lines.push_back(nlohmann::json::parse(line));
      } catch (const std::exception&) {
        if (!skipBad) throw;
      }
    }
    return lines;
  }

  static std::map<std::string, nlohmann::json> ByFile(const std::vector<nlohmann::json>& lines) {
    std::map<std::string, nlohmann::json> m;
    for (const nlohmann::json& j : Results(lines)) {
      EXPECT_EQ(m.count(j["file"]), 0u) << "page recorded twice: " << j["file"];
      m[j["file"]] = j;
    }
    return m;
  }
};

TEST_F(BatchTest, ParallelAndSequentialRunsGiveIdenticalResults) {
  MakeFolder(6);
  const RunOutcome one = Fringe({"all", "--json", "-j", "1", tmp_ / "in", "-o", tmp_ / "out1"});
  const RunOutcome two = Fringe({"all", "--json", "-j", "2", tmp_ / "in", "-o", tmp_ / "out2"});
  EXPECT_EQ(one.exitCode, 2) << one.err;
  EXPECT_EQ(two.exitCode, 2) << two.err;
  auto a = Results(one.JsonLines()), b = Results(two.JsonLines());
  ASSERT_EQ(a.size(), 8u);
  ASSERT_EQ(b.size(), 8u);
  for (size_t i = 0; i < a.size(); ++i) {
    // Output paths differ only in the folder asked for.
    for (const char* key : {"outline", "photo"}) {
      if (b[i].contains(key)) {
        std::string p = b[i][key];
        b[i][key] = p.replace(p.find("out2"), 4, "out1");
      }
    }
    EXPECT_EQ(a[i], b[i]) << i;  // same order, same answers, same bits
  }
  EXPECT_EQ(a[6]["status"], "not_found");
  EXPECT_EQ(a[7]["status"], "error");
  // Same files, same bytes.
  for (const auto& e : std::filesystem::recursive_directory_iterator(tmp_ / "out1")) {
    if (!e.is_regular_file()) continue;
    const auto rel = std::filesystem::relative(e.path(), tmp_ / "out1");
    EXPECT_EQ(ReadFile(e.path()), ReadFile(tmp_ / "out2" / rel)) << rel;
  }
}

TEST_F(BatchTest, ProgressLinesAndSummaryOnStandardError) {
  MakeFolder(3);
  const RunOutcome r = Fringe({"detect", "-j", "2", tmp_ / "in"});
  EXPECT_EQ(r.exitCode, 2);
  EXPECT_NE(r.err.find("fringe: [1/5] "), std::string::npos) << r.err;
  EXPECT_NE(r.err.find("fringe: [5/5] "), std::string::npos) << r.err;
  EXPECT_NE(r.err.find("fringe: " + (tmp_ / "in/sub/broken.png") + ": "), std::string::npos);
  EXPECT_NE(r.err.find("5 pages in "), std::string::npos) << r.err;
  EXPECT_NE(r.err.find("3 photos found, 1 without photo, 1 errors"), std::string::npos) << r.err;
  // Text results: one line per page on standard output, in name order.
  EXPECT_EQ(r.out.find(tmp_ / "in/p10.png"), 0u) << r.out;
  const RunOutcome quiet = Fringe({"detect", "-q", tmp_ / "in"});
  EXPECT_EQ(quiet.err, "fringe: " + (tmp_ / "in/sub/broken.png") +
                           ": not an image format that libvips "
                           "can read, or damaged beyond recognition\n");
}

TEST_F(BatchTest, AnInterruptedResultsFileResumesWithTheMissingPages) {
  MakeFolder(4);
  const std::string results = tmp_ / "results.jsonl";
  const RunOutcome whole =
      Fringe({"detect", "--json", "-j", "2", "--results", results, tmp_ / "in"});
  ASSERT_EQ(whole.exitCode, 2);
  const auto reference = ByFile(ReadLines(results));
  ASSERT_EQ(reference.size(), 6u);

  // Keep two whole lines and half of a third, as a run killed while writing would.
  std::ifstream in(results);
  std::string l1, l2, l3;
  std::getline(in, l1);
  std::getline(in, l2);
  std::getline(in, l3);
  in.close();
  std::ofstream(results, std::ios::trunc) << l1 << "\n"
                                          << l2 << "\n"
                                          << l3.substr(0, l3.size() / 2);

  const RunOutcome resumed =
      Fringe({"detect", "--json", "-j", "2", "--results", results, tmp_ / "in"});
  // The exit code covers the pages done earlier too.
  EXPECT_EQ(resumed.exitCode, 2);
  EXPECT_NE(resumed.err.find("unfinished last line dropped"), std::string::npos);
  EXPECT_NE(resumed.err.find("2 done earlier"), std::string::npos) << resumed.err;
  EXPECT_EQ(resumed.JsonLines().size(), 4u);  // only the pages not yet recorded
  // The half line is gone: every line is whole, one per page.
  const auto lines = ReadLines(results);
  EXPECT_EQ(lines.size(), 6u);
  EXPECT_EQ(ByFile(lines), reference);

  // Nothing left to do.
  const RunOutcome again = Fringe({"detect", "--json", "--results", results, tmp_ / "in"});
  EXPECT_EQ(again.exitCode, 2);
  EXPECT_TRUE(again.out.empty());
}

TEST_F(BatchTest, AKilledBatchLosesNothingItReported) {
  MakeFolder(10);
  const std::string results = tmp_ / "results.jsonl";
  const std::vector<std::string> args = {"all",       "--module", FringeModule(), "--json",
                                         "-j",        "2",        "--results",    results,
                                         tmp_ / "in", "-o",       tmp_ / "out"};
  const int pid = StartFringe(args, tmp_ / "stdout", tmp_ / "stderr");
  // Wait for the first page to be recorded, then kill the coordinator.
  bool reported = false;
  for (int i = 0; i < 6000 && !reported; ++i) {
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
    reported = std::filesystem::exists(results) && std::filesystem::file_size(results) > 0;
    int status = 0;
    if (::waitpid(pid, &status, WNOHANG) == pid) FAIL() << "finished before it could be killed";
  }
  ASSERT_TRUE(reported);
  ::kill(pid, SIGKILL);
  WaitFringe(pid);
  // Every page on standard output is also in the results file.
  const auto printed = ByFile(ReadLines(tmp_ / "stdout", true));
  const auto recorded = ByFile(ReadLines(results, true));
  for (const auto& [file, line] : printed) {
    ASSERT_EQ(recorded.count(file), 1u) << file;
    EXPECT_EQ(recorded.at(file), line);
  }
  ASSERT_LT(recorded.size(), 12u);

  const RunOutcome resumed = RunFringe(args);
  EXPECT_EQ(resumed.exitCode, 2) << resumed.err;
  const auto all = ByFile(ReadLines(results, true));
  EXPECT_EQ(all.size(), 12u);
  for (const auto& [file, line] : all) {
    if (line["status"] == "found") {
      EXPECT_TRUE(std::filesystem::exists(line["photo"].get<std::string>())) << file;
    }
  }
  // No half-written files are left in the output folder.
  for (const auto& e : std::filesystem::recursive_directory_iterator(tmp_ / "out")) {
    EXPECT_NE(e.path().filename().string()[0], '.') << e.path();
  }
}

}  // namespace
}  // namespace FringeTest

namespace FringeTest {
namespace {

TEST(WorkerIsolation, AModuleThatCrashesCostsOnlyThatPage) {
  TempFolder tmp;
  std::vector<std::string> args = {"detect", "--json", "--module", CrashingModule()};
  for (int width : {100, 101, 102, 103, 104}) {
    const std::string path = tmp / (std::string("w") + std::to_string(width) + ".png");
    vips::VImage::black(width, 50).pngsave(path.c_str());
    args.push_back(path);
  }
  for (const char* jobs : {"1", "2"}) {
    SCOPED_TRACE(jobs);
    std::vector<std::string> withJobs = args;
    withJobs.insert(withJobs.begin() + 1, {"-j", jobs});
    const RunOutcome r = RunFringe(withJobs);
    EXPECT_EQ(r.exitCode, 70) << r.err;
    const auto lines = r.JsonLines();
    ASSERT_EQ(lines.size(), 5u) << r.out << r.err;
    for (size_t i = 0; i < lines.size(); ++i) {
      EXPECT_EQ(lines[i]["status"], "error");
      EXPECT_EQ(lines[i]["error_kind"], "internal");
      const std::string error = lines[i]["error"];
      if (i % 2 == 1) {
        EXPECT_NE(error.find("worker process killed by signal 6"), std::string::npos) << error;
      } else {
        EXPECT_NE(error.find("no 'fRNG' record"), std::string::npos) << error;
      }
    }
  }
}

}  // namespace
}  // namespace FringeTest
