// The results file: what an interrupted batch finds there when it resumes.
#include <gtest/gtest.h>

#include <fstream>

#include "page_error.h"
#include "program_run.h"
#include "result_json.h"
#include "results_log.h"
#include "temp_folder.h"

namespace Fringe {
namespace {

PageResult Found(const std::string& file) {
  PageResult r;
  r.file = file;
  r.status = PageStatus::Found;
  r.width = 100;
  r.height = 80;
  r.format = "png";
  r.answer.found = true;
  r.answer.confidence = 255;
  r.answer.angle = 1.25;
  r.answer.corners = {{{10, 10}, {90, 12}, {88, 70}, {8, 68}}};
  return r;
}

std::string ReadAll(const std::string& path) {
  return FringeTest::ReadFile(path);
}

TEST(ResultsLog, ReadsBackEveryRecordedPage) {
  FringeTest::TempFolder tmp;
  const std::string path = tmp / "results.jsonl";
  {
    ResultsLog log(path);
    EXPECT_TRUE(log.Done().empty());
    log.Append(Found("a.png"));
    log.Append(ErrorResult("b.png", ErrorKind::BadInput, "empty file"));
    PageResult none = Found("c.png");
    none.status = PageStatus::NotFound;
    log.Append(none);
  }
  ResultsLog again(path);
  EXPECT_TRUE(again.Warnings().empty());
  ASSERT_EQ(again.Done().size(), 3u);
  EXPECT_EQ(again.Done().at("a.png").answer.corners, Found("a.png").answer.corners);
  EXPECT_EQ(again.Done().at("b.png").status, PageStatus::Error);
  EXPECT_EQ(again.Done().at("c.png").status, PageStatus::NotFound);
}

TEST(ResultsLog, InternalFailuresAreTriedAgain) {
  FringeTest::TempFolder tmp;
  const std::string path = tmp / "results.jsonl";
  {
    ResultsLog log(path);
    log.Append(Found("a.png"));
    log.Append(ErrorResult("a.png", ErrorKind::Internal, "worker process died"));
    log.Append(ErrorResult("b.png", ErrorKind::Internal, "worker process died"));
    log.Append(Found("b.png"));
  }
  ResultsLog again(path);
  // The last word on a page counts: a.png failed last, b.png succeeded last.
  EXPECT_EQ(again.Done().count("a.png"), 0u);
  ASSERT_EQ(again.Done().count("b.png"), 1u);
  EXPECT_EQ(again.Done().at("b.png").status, PageStatus::Found);
}

TEST(ResultsLog, APartialLastLineIsCutOffAndThePageRecordedOnceWhenDone) {
  FringeTest::TempFolder tmp;
  const std::string path = tmp / "results.jsonl";
  const std::string whole = JsonLine(Found("a.png")) + "\n";
  const std::string cut = JsonLine(Found("b.png")).substr(0, 40);
  { std::ofstream(path) << whole << "not json at all\n" << cut; }
  {
    ResultsLog log(path);
    ASSERT_EQ(log.Warnings().size(), 2u);
    EXPECT_NE(log.Warnings()[0].find(":2:"), std::string::npos);
    EXPECT_NE(log.Warnings()[1].find("unfinished"), std::string::npos);
    EXPECT_EQ(log.Done().size(), 1u);
    log.Append(Found("b.png"));
  }
  EXPECT_EQ(ReadAll(path), whole + "not json at all\n" + JsonLine(Found("b.png")) + "\n");
  ResultsLog again(path);
  EXPECT_EQ(again.Done().size(), 2u);
}

TEST(ResultsLog, AWholeLastRecordWithoutItsLineEndIsKept) {
  FringeTest::TempFolder tmp;
  const std::string path = tmp / "results.jsonl";
  const std::string a = JsonLine(Found("a.png"));
  { std::ofstream(path) << a; }
  {
    ResultsLog log(path);
    EXPECT_TRUE(log.Warnings().empty());
    EXPECT_EQ(log.Done().count("a.png"), 1u);
    log.Append(Found("b.png"));
  }
  EXPECT_EQ(ReadAll(path), a + "\n" + JsonLine(Found("b.png")) + "\n");
}

TEST(ResultsLog, AnUnusablePathIsAnOutputError) {
  FringeTest::TempFolder tmp;
  try {
    ResultsLog log(tmp / "missing/folder/results.jsonl");
    FAIL() << "no error";
  } catch (const PageError& e) {
    EXPECT_EQ(e.Kind(), ErrorKind::Output);
    EXPECT_NE(std::string(e.what()).find("results.jsonl"), std::string::npos);
  }
}

}  // namespace
}  // namespace Fringe
