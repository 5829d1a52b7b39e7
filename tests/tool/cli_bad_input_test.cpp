// Files fringe cannot use: each gets a clear error naming it, exit code 2,
// and the other pages of the batch go on.
#include <unistd.h>
#include <zlib.h>

#include <fstream>

#include "cli_fixture.h"

namespace FringeTest {
namespace {

void WriteBytes(const std::string& path, const std::string& bytes) {
  std::ofstream(path, std::ios::binary) << bytes;
}

std::string BigEndian(uint32_t v) {
  return {static_cast<char>(v >> 24), static_cast<char>(v >> 16), static_cast<char>(v >> 8),
          static_cast<char>(v)};
}

std::string PngChunk(const std::string& type, const std::string& data) {
  const std::string body = type + data;
  const uLong crc =
      crc32(0, reinterpret_cast<const Bytef*>(body.data()), static_cast<uInt>(body.size()));
  return BigEndian(static_cast<uint32_t>(data.size())) + body +
         BigEndian(static_cast<uint32_t>(crc));
}

// A PNG whose header promises width x height RGB pixels and holds almost none.
std::string PromisingPng(uint32_t width, uint32_t height) {
  std::string ihdr = BigEndian(width) + BigEndian(height);
  ihdr += std::string("\x08\x02\x00\x00\x00", 5);
  return std::string("\x89PNG\r\n\x1a\n", 8) + PngChunk("IHDR", ihdr) +
         PngChunk("IDAT", std::string("\x78\x9c\x03\x00\x00\x00\x00\x01", 8)) +
         PngChunk("IEND", "");
}

class BadInputTest : public CliTest {
 protected:
  // Runs one file and checks the error's shape; returns the error text.
  std::string ExpectRefused(const std::string& path, std::vector<std::string> extra = {}) {
    std::vector<std::string> args = {"detect", "--json"};
    args.insert(args.end(), extra.begin(), extra.end());
    args.push_back(path);
    const RunOutcome r = Fringe(args);
    EXPECT_EQ(r.exitCode, 2) << r.out << r.err;
    const nlohmann::json line = OnlyLine(r);
    EXPECT_EQ(line["file"], path);
    EXPECT_EQ(line["status"], "error");
    EXPECT_EQ(line["error_kind"], "bad_input");
    // Standard error names the file and the same reason.
    EXPECT_NE(r.err.find("fringe: " + path + ": " + line.value("error", "?")), std::string::npos)
        << r.err;
    return line.value("error", "");
  }
};

TEST_F(BadInputTest, EmptyRandomAndTextFiles) {
  WriteBytes(tmp_ / "empty.png", "");
  EXPECT_EQ(ExpectRefused(tmp_ / "empty.png"), "empty file");

  std::string noise;
  uint32_t x = 12345;
  for (int i = 0; i < 20000; ++i) noise += static_cast<char>((x = x * 1103515245 + 12345) >> 24);
  WriteBytes(tmp_ / "noise.png", noise);
  EXPECT_NE(ExpectRefused(tmp_ / "noise.png").find("not an image"), std::string::npos);

  WriteBytes(tmp_ / "notes.jpg", "these are my notes, not a scan\n");
  EXPECT_NE(ExpectRefused(tmp_ / "notes.jpg").find("not an image"), std::string::npos);

  EXPECT_NE(ExpectRefused(tmp_ / "missing.png").find("No such file"), std::string::npos);
  std::filesystem::create_symlink(tmp_ / "missing.png", tmp_ / "dangling.png");
  EXPECT_EQ(ExpectRefused(tmp_ / "dangling.png"), "broken symbolic link");
}

TEST_F(BadInputTest, TruncatedFilesOfEachFormat) {
  for (const char* ext : {"png", "jpg", "tif", "webp"}) {
    SCOPED_TRACE(ext);
    const std::string whole = WritePageFile(std::string("whole.") + ext);
    const std::string bytes = ReadFile(whole);
    const std::string cut = tmp_ / (std::string("cut.") + ext);
    WriteBytes(cut, bytes.substr(0, bytes.size() / 2));
    const std::string why = ExpectRefused(cut);
    EXPECT_FALSE(why.empty());
  }
}

TEST_F(BadInputTest, AMislabelledImageIsReadByItsContent) {
  const std::string png = WritePageFile("page.png");
  const std::string named = tmp_ / "page.jpg";
  std::filesystem::rename(png, named);
  const RunOutcome r = Fringe({"crop", "--json", named, "-o", tmp_ / "out"});
  ASSERT_EQ(r.exitCode, 0) << r.err;
  const nlohmann::json line = OnlyLine(r);
  EXPECT_EQ(line["format"], "png");
  EXPECT_EQ(line["photo"], tmp_ / "out/page.photo.png");
}

TEST_F(BadInputTest, HeadersPromisingTooManyPixelsAreRefusedBeforeDecoding) {
  WriteBytes(tmp_ / "bomb.png", PromisingPng(200000, 200000));
  const RunOutcome r = Fringe({"detect", tmp_ / "bomb.png"});
  EXPECT_EQ(r.exitCode, 2);
  EXPECT_NE(r.err.find("40000000000 pixels, above the limit of 250000000 (--max-pixels)"),
            std::string::npos)
      << r.err;
  // Refused from the header: nothing near the promised size was allocated.
  EXPECT_LT(r.peakKilobytes, 200 * 1024);

  // The limit can be lowered.
  const std::string page = WritePageFile("page.png");
  EXPECT_NE(ExpectRefused(page, {"--max-pixels", "479999"}).find("--max-pixels"),
            std::string::npos);
}

TEST_F(BadInputTest, PagesBeyondTheModulesSideNeedMaxSide) {
  // 40000 x 40 with a dark block: too wide for the module's 16-bit coordinates.
  vips::VImage wide = vips::VImage::black(40000, 40).new_from_image({230}).copy_memory();
  wide.draw_rect({40}, 15000, 5, 10000, 30, vips::VImage::option()->set("fill", true));
  wide.pngsave((tmp_ / "wide.png").c_str());
  const std::string why = ExpectRefused(tmp_ / "wide.png");
  EXPECT_NE(why.find("40000 x 40"), std::string::npos);
  EXPECT_NE(why.find("--max-side"), std::string::npos);

  const RunOutcome r = Fringe({"detect", "--json", "--max-side", "20000", tmp_ / "wide.png"});
  ASSERT_NE(r.exitCode, 2) << r.err;
  const nlohmann::json line = OnlyLine(r);
  EXPECT_EQ(line["width"], 40000);
  EXPECT_EQ(line["detect_scale"], 0.5);
  // Corners are in the file's pixels, not the copy's.
  for (const auto& c : line["corners"]) {
    EXPECT_GE(c[0].get<int>(), 0);
    EXPECT_LT(c[0].get<int>(), 40000);
  }
}

TEST_F(BadInputTest, MaxSideScalesCornersBackToTheFullPage) {
  const std::string path = WritePageFile("page.png", Layout::Rgb, 9.0, true, 1600, 1200);
  const nlohmann::json full = OnlyLine(Fringe({"detect", "--json", path}));
  const nlohmann::json half = OnlyLine(Fringe({"detect", "--json", "--max-side", "800", path}));
  ASSERT_EQ(half["status"], "found");
  EXPECT_EQ(half["detect_scale"], 0.5);
  EXPECT_FALSE(full.contains("detect_scale"));
  for (int k = 0; k < 4; ++k) {
    for (int a = 0; a < 2; ++a) {
      EXPECT_NEAR(half["corners"][k][a].get<double>(), full["corners"][k][a].get<double>(), 6.0);
    }
  }
  EXPECT_LT(CornerError(half, last_), 8.0);
}

TEST_F(BadInputTest, OneBadFileDoesNotStopTheOthers) {
  const std::string good = WritePageFile("a_good.png");
  WriteBytes(tmp_ / "b_bad.png", "junk");
  const std::string good2 = WritePageFile("c_good.jpg");
  const RunOutcome r = Fringe({"detect", "--json", "-j", "2", good, tmp_ / "b_bad.png", good2});
  EXPECT_EQ(r.exitCode, 2);
  const auto lines = r.JsonLines();
  ASSERT_EQ(lines.size(), 3u);
  EXPECT_EQ(lines[0]["status"], "found");
  EXPECT_EQ(lines[1]["status"], "error");
  EXPECT_EQ(lines[2]["status"], "found");
}

}  // namespace
}  // namespace FringeTest
