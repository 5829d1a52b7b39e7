// JSON results and the worker protocol: exact numbers, any file name.
#include <gtest/gtest.h>

#include <cstring>
#include <limits>

#include "result_json.h"
#include "worker_protocol.h"

namespace Fringe {
namespace {

PageResult Sample(double angle) {
  PageResult r;
  r.file = "scans/a b.png";
  r.status = PageStatus::Found;
  r.width = 1200;
  r.height = 900;
  r.gray = true;
  r.alpha = true;
  r.format = "tiff";
  r.answer = {true, {{{275, 270}, {870, 191}, {923, 592}, {328, 671}}}, angle, 255, 0.5};
  r.outlinePath = "out/a b.outline.png";
  r.photoPath = "out/a b.photo.tif";
  r.times = {1.5, 2.25, 3.0};
  return r;
}

uint64_t Bits(double d) {
  uint64_t u = 0;
  std::memcpy(&u, &d, sizeof u);
  return u;
}

TEST(ResultJson, AnglesReadBackToTheSameDouble) {
  for (double angle :
       {7.542214912280702, 0.1 + 0.2, -44.5, 1e-300, 4.9e-324, -0.0, std::nextafter(45.0, 0.0)}) {
    const PageResult r = Sample(angle);
    const PageResult back = ResultFromJson(nlohmann::json::parse(JsonLine(r)));
    EXPECT_EQ(Bits(back.answer.angle), Bits(angle)) << JsonLine(r);
    EXPECT_EQ(back.answer, r.answer);
    EXPECT_EQ(back.file, r.file);
    EXPECT_EQ(back.outlinePath, r.outlinePath);
    EXPECT_EQ(back.photoPath, r.photoPath);
    EXPECT_EQ(back.gray, r.gray);
    EXPECT_EQ(back.alpha, r.alpha);
    EXPECT_EQ(back.format, r.format);
  }
}

TEST(ResultJson, SchemaOfEachStatus) {
  const nlohmann::json found = nlohmann::json::parse(JsonLine(Sample(2.0)));
  EXPECT_EQ(found["status"], "found");
  EXPECT_EQ(found["mode"], "gray");
  EXPECT_EQ(found["corners"], nlohmann::json::parse("[[275,270],[870,191],[923,592],[328,671]]"));
  EXPECT_EQ(found["detect_scale"], 0.5);
  EXPECT_FALSE(found.contains("error"));
  for (const char* k : {"decode", "detect", "write"}) EXPECT_TRUE(found["times_ms"][k].is_number());

  const PageResult bad = ErrorResult("x.png", ErrorKind::BadInput, "empty file");
  const nlohmann::json error = nlohmann::json::parse(JsonLine(bad));
  EXPECT_EQ(
      error,
      nlohmann::json::parse(
          R"({"file":"x.png","status":"error","error":"empty file","error_kind":"bad_input"})"));
  const PageResult back = ResultFromJson(error);
  EXPECT_EQ(back.status, PageStatus::Error);
  EXPECT_EQ(back.errorKind, ErrorKind::BadInput);
  EXPECT_EQ(back.error, "empty file");

  EXPECT_THROW(ResultFromJson(nlohmann::json::parse(R"({"file":"x","status":"maybe"})")),
               std::exception);
  EXPECT_THROW(ResultFromJson(nlohmann::json::parse(R"([1,2])")), std::exception);
}

TEST(ResultJson, NamesThatAreNotUtf8StillMakeALine) {
  PageResult r = Sample(1.0);
  r.file = std::string("scan\xff\xfe.png");
  const std::string line = JsonLine(r);
  const nlohmann::json j = nlohmann::json::parse(line);
  EXPECT_EQ(j["file"].get<std::string>(), AsJsonText(r.file));
  EXPECT_NE(AsJsonText(r.file), r.file);
  EXPECT_EQ(AsJsonText("plain.png"), "plain.png");
}

TEST(WorkerProtocol, EveryByteOfAPathArrives) {
  std::string all;
  for (int c = 1; c < 256; ++c) all += static_cast<char>(c);
  EXPECT_EQ(HexDecode(HexEncode(all)), all);
  EXPECT_THROW(HexDecode("abc"), std::exception);
  EXPECT_THROW(HexDecode("zz"), std::exception);

  const PageTask task{all, "shown\n\"name\"", "sub/stem"};
  const auto [id, back] = ParseJobLine(JobLine(41, task));
  EXPECT_EQ(id, 41u);
  EXPECT_EQ(back.path, task.path);
  EXPECT_EQ(back.display, task.display);
  EXPECT_EQ(back.outStem, task.outStem);
}

TEST(WorkerProtocol, SetupAndRepliesRoundTrip) {
  PageSettings s;
  s.outputs = {true, true};
  s.outputDir = std::string("out\xff");
  s.photoFormat = "webp";
  s.margin = 7;
  s.maxSide = 4000;
  s.maxPixels = 123456789012ull;
  std::string module;
  PageSettings back;
  ParseSetupLine(SetupLine("/x/Fringe.9zf", s), module, back);
  EXPECT_EQ(module, "/x/Fringe.9zf");
  EXPECT_EQ(back.outputDir, s.outputDir);
  EXPECT_EQ(back.photoFormat, "webp");
  EXPECT_EQ(back.margin, 7);
  EXPECT_EQ(back.maxSide, 4000);
  EXPECT_EQ(back.maxPixels, 123456789012ull);
  EXPECT_TRUE(back.outputs.outline && back.outputs.photo);

  const Reply reply = ParseReplyLine(ReplyLine(3, Sample(-3.5)));
  ASSERT_TRUE(reply.id.has_value());
  EXPECT_EQ(*reply.id, 3u);
  EXPECT_EQ(reply.result.answer, Sample(-3.5).answer);
  const Reply fatal = ParseReplyLine(FatalLine("cannot load module"));
  EXPECT_FALSE(fatal.id.has_value());
  EXPECT_EQ(fatal.fatal, "cannot load module");
}

}  // namespace
}  // namespace Fringe
