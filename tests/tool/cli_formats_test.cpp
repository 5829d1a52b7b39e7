// Every file format and sample layout fringe reads, through the program.
#include <tuple>

#include "cli_fixture.h"

namespace FringeTest {
namespace {

struct FormatCase {
  const char* ext;
  Layout layout;
  const char* loader;  // the "format" fringe reports
};

std::string CaseName(const ::testing::TestParamInfo<FormatCase>& info) {
  return std::string(info.param.ext) + "_" + LayoutName(info.param.layout);
}

class FormatTest : public CliTest, public ::testing::WithParamInterface<FormatCase> {};

TEST_P(FormatTest, PhotoIsFoundInTheRightDocumentMode) {
  const FormatCase& c = GetParam();
  const std::string path = WritePageFile(std::string("page.") + c.ext, c.layout, -6.0);
  const RunOutcome r = Fringe({"detect", "--json", path});
  ASSERT_EQ(r.exitCode, 0) << r.err;
  const nlohmann::json line = OnlyLine(r);
  EXPECT_EQ(line["status"], "found");
  EXPECT_EQ(line["file"], path);
  EXPECT_EQ(line["format"], c.loader);
  EXPECT_EQ(line["width"], 800);
  EXPECT_EQ(line["height"], 600);
  const bool gray =
      c.layout == Layout::Gray || c.layout == Layout::Gray16 || c.layout == Layout::GrayAlpha;
  EXPECT_EQ(line["mode"], gray ? "gray" : "rgb");
  EXPECT_EQ(line["alpha"], c.layout == Layout::RgbAlpha || c.layout == Layout::GrayAlpha);
  EXPECT_EQ(line["confidence"], 255);
  EXPECT_NEAR(line["angle"].get<double>(), -6.0, 0.5);
  EXPECT_LT(CornerError(line, last_), 6.0) << line.dump();
}

INSTANTIATE_TEST_SUITE_P(
    Formats, FormatTest,
    ::testing::Values(
        FormatCase{"png", Layout::Rgb, "png"}, FormatCase{"png", Layout::Gray, "png"},
        FormatCase{"png", Layout::Palette, "png"}, FormatCase{"png", Layout::Rgb16, "png"},
        FormatCase{"png", Layout::Gray16, "png"}, FormatCase{"png", Layout::RgbAlpha, "png"},
        FormatCase{"png", Layout::GrayAlpha, "png"}, FormatCase{"jpg", Layout::Rgb, "jpeg"},
        FormatCase{"jpg", Layout::Gray, "jpeg"}, FormatCase{"jpg", Layout::Cmyk, "jpeg"},
        FormatCase{"tif", Layout::Rgb, "tiff"}, FormatCase{"tif", Layout::Gray, "tiff"},
        FormatCase{"tif", Layout::Cmyk, "tiff"}, FormatCase{"tif", Layout::Rgb16, "tiff"},
        FormatCase{"tif", Layout::RgbAlpha, "tiff"}, FormatCase{"webp", Layout::Rgb, "webp"},
        FormatCase{"webp", Layout::RgbAlpha, "webp"}),
    CaseName);

}  // namespace
}  // namespace FringeTest
