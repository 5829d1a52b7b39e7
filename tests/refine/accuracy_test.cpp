// Scoring and truth files of the accuracy report.
#include <gtest/gtest.h>

#include <unistd.h>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

#include "accuracy/evaluation.h"
#include "accuracy/report.h"
#include "accuracy/run.h"
#include "accuracy/truth_file.h"

namespace Accuracy {
namespace {

Truth Photo() {
  Truth t;
  t.photo = true;
  t.corners = {Refine::Vec2{100, 100}, Refine::Vec2{300, 100}, Refine::Vec2{300, 250},
               Refine::Vec2{100, 250}};
  t.angle = 0.0;
  return t;
}

Answer Shifted(const Truth& t, double dx, double dy, double angle = 0.0) {
  Answer a;
  a.photo = true;
  a.corners = t.corners;
  for (auto& c : a.corners) c = {c.x + dx, c.y + dy};
  a.angle = angle;
  return a;
}

TEST(Accuracy, FoundMeansEveryCornerWithinTenPixels) {
  const Truth t = Photo();
  EXPECT_TRUE(ScoreAnswer(t, Shifted(t, 6.0, 8.0)).found);  // exactly 10 px
  EXPECT_FALSE(ScoreAnswer(t, Shifted(t, 6.0, 8.01)).found);
  Answer one = Shifted(t, 0.0, 0.0);
  one.corners[2].x += 10.5;
  const Score s = ScoreAnswer(t, one);
  EXPECT_FALSE(s.found);
  EXPECT_DOUBLE_EQ(s.maxCornerError, 10.5);
  EXPECT_DOUBLE_EQ(s.cornerError[0], 0.0);
  Answer none = Shifted(t, 0.0, 0.0);
  none.photo = false;
  EXPECT_FALSE(ScoreAnswer(t, none).found);
  EXPECT_FALSE(ScoreAnswer(t, none).reported);
}

TEST(Accuracy, AngleErrorIsFoldedToAQuarterTurn) {
  const Truth t = Photo();
  EXPECT_NEAR(ScoreAnswer(t, Shifted(t, 0, 0, 89.5)).angleError, 0.5, 1e-12);
  EXPECT_NEAR(ScoreAnswer(t, Shifted(t, 0, 0, -0.25)).angleError, 0.25, 1e-12);
}

TEST(Accuracy, BlankPagesCountFalseAlarms) {
  Truth blank;
  Answer quiet;
  EXPECT_FALSE(ScoreAnswer(blank, quiet).falseAlarm);
  Answer loud;
  loud.photo = true;
  EXPECT_TRUE(ScoreAnswer(blank, loud).falseAlarm);
  const Summary s = Summarise({ScoreAnswer(blank, quiet), ScoreAnswer(blank, loud)});
  EXPECT_EQ(s.blankPages, 2);
  EXPECT_EQ(s.blankQuiet, 1);
  EXPECT_EQ(s.photoPages, 0);
}

TEST(Accuracy, SummaryTakesNearestRankPercentiles) {
  const Truth t = Photo();
  std::vector<Score> scores;
  // 5 pages, every corner off by 1, 2, 3, 4 and 20 px: 20 corner errors.
  for (double d : {1.0, 2.0, 3.0, 4.0, 20.0}) scores.push_back(ScoreAnswer(t, Shifted(t, d, 0.0)));
  Answer missing;
  scores.push_back(ScoreAnswer(t, missing));  // a photo page with no photo reported
  const Summary s = Summarise(scores);
  EXPECT_EQ(s.photoPages, 6);
  EXPECT_EQ(s.found, 4);
  EXPECT_EQ(s.cornersMeasured, 20);
  EXPECT_DOUBLE_EQ(s.meanError, 6.0);
  EXPECT_DOUBLE_EQ(s.medianError, 3.0);
  EXPECT_DOUBLE_EQ(s.p95Error, 20.0);
  EXPECT_DOUBLE_EQ(s.maxError, 20.0);
}

TEST(Accuracy, AnswersMoveIntoTheTruthsCoordinates) {
  Refine::ModuleAnswer m =
      Refine::ModuleAnswer::FromPoints({10, 20, 10, 120, 90, 120, 90, 20}, 0.5, 255);
  const Answer raw = RawAnswerOf(m);
  EXPECT_EQ(raw.corners[0].x, 20.5);  // the centre of pixel 20
  EXPECT_EQ(raw.corners[0].y, 10.5);
  EXPECT_TRUE(raw.photo);
  Refine::Refinement r;
  r.status = Refine::RefineStatus::kNoPhoto;
  EXPECT_FALSE(RefinedAnswerOf(r).photo);
}

class TruthFiles : public ::testing::Test {
 protected:
  void SetUp() override {
    dir_ = std::filesystem::temp_directory_path() / ("fringe-truth-" + std::to_string(::getpid()));
    std::filesystem::create_directories(dir_);
  }
  void TearDown() override { std::filesystem::remove_all(dir_); }
  std::string Write(const std::string& name, const std::string& text) {
    const auto path = (dir_ / name).string();
    std::ofstream(path) << text;
    return path;
  }
  std::filesystem::path dir_;
};

TEST_F(TruthFiles, RoundTrip) {
  Truth t = Photo();
  t.kind = "white-border";
  t.angle = -2.5;
  const std::string path = (dir_ / "page.truth.json").string();
  WriteTruthFile(path, t);
  const Truth back = ReadTruthFile(path);
  EXPECT_TRUE(back.photo);
  EXPECT_EQ(back.corners, t.corners);
  EXPECT_EQ(back.kind, "white-border");
  ASSERT_TRUE(back.angle);
  EXPECT_EQ(*back.angle, -2.5);
  EXPECT_EQ(TruthPathFor("/a/b/page.png"), "/a/b/page.truth.json");
}

TEST_F(TruthFiles, BadFilesAreRefusedByName) {
  const std::string cases[] = {"not json", R"({"corners": []})",
                               R"({"photo": true, "corners": [[1,2],[3,4],[5,6]]})",
                               R"({"photo": true, "corners": [[1,2],[3,4],[5,6],[7]]})",
                               R"({"photo": true, "corners": [[1,2],[3,4],[5,6],[7,"x"]]})"};
  int i = 0;
  for (const std::string& text : cases) {
    const std::string path = Write("bad" + std::to_string(i++) + ".truth.json", text);
    try {
      ReadTruthFile(path);
      ADD_FAILURE() << "accepted: " << text;
    } catch (const std::runtime_error& e) {
      EXPECT_NE(std::string(e.what()).find(path), std::string::npos) << e.what();
    }
  }
  EXPECT_THROW(ReadTruthFile((dir_ / "missing.truth.json").string()), std::runtime_error);
  // A blank page needs no corners.
  EXPECT_FALSE(ReadTruthFile(Write("blank.truth.json", R"({"photo": false})")).photo);
}

TEST(Accuracy, ReportPutsBothAnswersSideBySide) {
  const Truth t = Photo();
  PageOutcome o;
  o.name = "p";
  o.kind = "plain";
  o.raw = ScoreAnswer(t, Shifted(t, 12.0, 0.0));
  o.refined = ScoreAnswer(t, Shifted(t, 0.5, 0.0));
  const std::string table = SummaryTable({o});
  EXPECT_NE(
      table.find("| photos found (all four corners within 10 px) | 0/1 (0.0%) | 1/1 (100.0%) |"),
      std::string::npos)
      << table;
  EXPECT_NE(table.find("| corner error, median (px) | 12.00 | 0.50 |"), std::string::npos) << table;
  EXPECT_NE(KindTable({o}).find("| plain | 1 |"), std::string::npos);
}

}  // namespace
}  // namespace Accuracy
