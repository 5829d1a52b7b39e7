// The runner's command line and its results file: what the cross-platform
// comparison rests on.
#include <gtest/gtest.h>

#include <cstring>
#include <sstream>

#include "page_set.h"
#include "runner_options.h"
#include "standin/error.h"

namespace {

Runner::Options Parse(std::vector<std::string> words) {
  std::string program = "fringe-runner";
  std::vector<char*> argv{program.data()};
  for (std::string& word : words) argv.push_back(word.data());
  return Runner::ParseOptions(static_cast<int>(argv.size()), argv.data());
}

std::string ParseError(std::vector<std::string> words) {
  try {
    Parse(std::move(words));
  } catch (const Standin::Error& error) {
    return error.what();
  }
  return "(accepted)";
}

TEST(RunnerOptions, DocumentAndHostBehaviourFromTheCommandLine) {
  Runner::Options options = Parse(
      {"--size", "640x480", "--mode", "gray", "--alpha", "--rect", "1,2,300,400", "--budget", "0",
       "--cancel-at", "5", "--continues", "0", "--bottom-up", "--photo", "320,240,300,200,-12.5"});
  EXPECT_EQ(options.mode, Runner::Mode::Single);
  EXPECT_EQ(options.width, 640);
  EXPECT_EQ(options.height, 480);
  EXPECT_EQ(options.imageMode, 1);
  EXPECT_TRUE(options.alpha);
  EXPECT_EQ(options.rect, (std::array<int32_t, 4>{1, 2, 300, 400}));
  EXPECT_EQ(options.budget, 0);
  EXPECT_EQ(options.cancelAt, 5);
  EXPECT_EQ(options.continues, 0);
  EXPECT_TRUE(options.bottomUp);
  ASSERT_TRUE(options.page.photo);
  EXPECT_EQ(options.page.photo->angleDegrees, -12.5);
  EXPECT_EQ(options.page.width, 640);
  EXPECT_FALSE(options.page.color);
  EXPECT_TRUE(options.page.alpha);
  EXPECT_FALSE(Parse({"--blank"}).page.photo);
  EXPECT_EQ(Parse({"--mode", "7"}).imageMode, 7);
}

TEST(RunnerOptions, BadWordsAreNamed) {
  EXPECT_EQ(ParseError({"--size", "640"}), "--size takes WIDTHxHEIGHT, got '640'");
  EXPECT_EQ(ParseError({"--size", "0x10"}), "--size: '0' is not a whole number from 1 to 65535");
  EXPECT_EQ(ParseError({"--rect", "1,2,3"}), "--rect takes 4 numbers, got '1,2,3'");
  EXPECT_EQ(ParseError({"--photo", "1,2,3,x,5"}), "--photo: 'x' is not a number");
  EXPECT_EQ(ParseError({"--module"}), "--module needs a value");
  EXPECT_EQ(ParseError({"--frobnicate"}), "unknown option '--frobnicate' (see --help)");
}

TEST(PageSets, SweepIsDrawnTheSameWayEveryTime) {
  auto first = Runner::SweepPages(50, 9);
  auto again = Runner::SweepPages(50, 9);
  auto other = Runner::SweepPages(50, 10);
  ASSERT_EQ(first.size(), 50u);
  int photos = 0, differing = 0;
  for (size_t i = 0; i < first.size(); ++i) {
    EXPECT_EQ(first[i].width, again[i].width);
    EXPECT_EQ(first[i].seed, again[i].seed);
    ASSERT_EQ(first[i].photo.has_value(), again[i].photo.has_value());
    if (first[i].photo) {
      ++photos;
      EXPECT_EQ(std::memcmp(&*first[i].photo, &*again[i].photo, sizeof(Synth::PhotoRecipe)), 0);
      EXPECT_GE(first[i].photo->angleDegrees, -40.0);
      EXPECT_LT(first[i].photo->angleDegrees, 40.0);
    }
    differing += first[i].seed != other[i].seed ? 1 : 0;
  }
  EXPECT_GT(photos, 40);
  EXPECT_GT(differing, 45);
}

TEST(PageSets, ResultsSurviveTheFileAndDifferencesAreNamed) {
  Runner::PageResult a;
  a.pageHash = 0x0123456789ABCDEFull;
  a.selectors = {0, 0, 0, -108, 1, 0};
  a.recordPresent = true;
  a.record = {1, -2, 3, -4, 5, -6, 7, -8, 255};
  a.descriptorPresent = true;
  double angle = -0.0;
  std::memcpy(&a.angleBits, &angle, sizeof angle);
  a.confidence = 127;
  a.points = {-32768, 32767, 0, 1, 2, 3, 4, 5};
  Runner::PageResult b = a;
  b.failed = true;
  std::stringstream file;
  Runner::WriteResults(file, "sweep 2 7", {a, b});
  std::string header;
  std::vector<Runner::PageResult> back = Runner::ReadResults(file, &header);
  EXPECT_EQ(header, "sweep 2 7");
  ASSERT_EQ(back.size(), 2u);
  EXPECT_TRUE(Runner::Differences(back[0], a).empty()) << Runner::Describe(back[0]);
  EXPECT_EQ(Runner::Differences(back[0], back[1]), (std::vector<std::string>{"error"}));

  b = a;
  b.angleBits ^= 1;  // the last bit of the angle
  b.pageHash ^= 1;
  EXPECT_EQ(Runner::Differences(a, b), (std::vector<std::string>{"page pixels", "angle"}));
}

TEST(PageSets, DamagedResultsFilesAreRefused) {
  std::string header;
  std::stringstream none("golden\n");
  EXPECT_THROW(Runner::ReadResults(none, &header), Standin::Error);
  std::stringstream cut("fringe-results golden\n0123456789abcdef sel 0 0 0\n");
  EXPECT_THROW(Runner::ReadResults(cut, &header), Standin::Error);
}

}  // namespace
