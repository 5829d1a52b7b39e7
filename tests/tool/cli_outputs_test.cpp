// The written files: straightened photos of the photo's size holding the
// photo, outline pictures, formats, colour profiles, and the output folder.
#include <cstring>
#include <fstream>

#include "cli_fixture.h"

namespace FringeTest {
namespace {

using OutputsTest = CliTest;

// Mean of the outermost rows and columns of the image.
double BorderMean(const vips::VImage& image) {
  const int w = image.width(), h = image.height(), b = 3;
  const vips::VImage gray = image.extract_band(0, vips::VImage::option()->set("n", 3))
                                .colourspace(VIPS_INTERPRETATION_B_W);
  return (gray.crop(0, 0, w, b).avg() + gray.crop(0, h - b, w, b).avg() +
          gray.crop(0, 0, b, h).avg() + gray.crop(w - b, 0, b, h).avg()) /
         4.0;
}

TEST_F(OutputsTest, CropsHaveThePhotosSizeAndHoldOnlyThePhoto) {
  for (double angle : {-31.0, -12.5, -3.0, 0.0, 4.5, 17.0, 35.0}) {
    SCOPED_TRACE(angle);
    const std::string page = WritePageFile("page.png", Layout::Rgb, angle, true, 1000, 750);
    const RunOutcome r = Fringe({"crop", "--json", page, "-o", tmp_ / "out"});
    ASSERT_EQ(r.exitCode, 0) << r.err;
    const nlohmann::json line = OnlyLine(r);
    const vips::VImage photo =
        vips::VImage::new_from_file(line["photo"].get<std::string>().c_str());
    EXPECT_NEAR(photo.width(), lastRecipe_.photo->width, 5.0);
    EXPECT_NEAR(photo.height(), lastRecipe_.photo->height, 5.0);
    // The paper is near white and the photo's samples stay below 171: an edge
    // of paper (a crop turned the wrong way or misplaced) would lift the mean.
    EXPECT_LT(BorderMean(photo), 150.0);
  }
}

TEST_F(OutputsTest, MarginWidensTheCropOnEverySide) {
  const std::string page = WritePageFile("page.png", Layout::Rgb, 7.0);
  const auto plain = OnlyLine(Fringe({"crop", "--json", page, "-o", tmp_ / "a"}));
  const auto wide = OnlyLine(Fringe({"crop", "--json", "--margin", "15", page, "-o", tmp_ / "b"}));
  const vips::VImage p = vips::VImage::new_from_file(plain["photo"].get<std::string>().c_str());
  const vips::VImage w = vips::VImage::new_from_file(wide["photo"].get<std::string>().c_str());
  EXPECT_EQ(w.width(), p.width() + 30);
  EXPECT_EQ(w.height(), p.height() + 30);
  EXPECT_GT(BorderMean(w), 200.0);  // the margin shows the paper
}

TEST_F(OutputsTest, OutlinePictureMarksTheCorners) {
  const std::string page = WritePageFile("page.jpg", Layout::Gray, 10.0);
  // PNG keeps the marks' colours exact.
  const RunOutcome r =
      Fringe({"draw", "--raw", "--json", "--outline-format", "png", page, "-o", tmp_ / "out"});
  ASSERT_EQ(r.exitCode, 0) << r.err;
  const nlohmann::json line = OnlyLine(r);
  EXPECT_FALSE(line.contains("photo"));
  EXPECT_EQ(line["outline"], tmp_ / "out/page.outline.png");
  const vips::VImage outline = vips::VImage::new_from_file((tmp_ / "out/page.outline.png").c_str());
  EXPECT_EQ(outline.width(), 800);
  EXPECT_EQ(outline.height(), 600);
  EXPECT_EQ(outline.bands(), 3);
  const auto& c = line["corners"];
  const auto at = [&](double x, double y) {
    return outline.getpoint(static_cast<int>(std::lround(x)), static_cast<int>(std::lround(y)));
  };
  EXPECT_EQ(at(c[0][0].get<double>(), c[0][1].get<double>()), (std::vector<double>{0, 200, 0}));
  for (int k = 1; k < 4; ++k) {
    EXPECT_EQ(at(c[k][0].get<double>(), c[k][1].get<double>()), (std::vector<double>{255, 0, 0}));
  }
  // Halfway along the top side.
  EXPECT_EQ(at((c[0][0].get<double>() + c[1][0].get<double>()) / 2,
               (c[0][1].get<double>() + c[1][1].get<double>()) / 2),
            (std::vector<double>{255, 0, 0}));
  // Away from the outline the page is as it was, gray.
  const std::vector<double> paper = at(20, 20);
  EXPECT_EQ(paper[0], paper[1]);
  EXPECT_EQ(paper[1], paper[2]);

  // JPEG by default.
  const auto jpg = OnlyLine(Fringe({"draw", "--json", page, "-o", tmp_ / "jpg"}));
  EXPECT_EQ(jpg["outline"], tmp_ / "jpg/page.outline.jpg");
  EXPECT_EQ(vips::VImage::new_from_file((tmp_ / "jpg/page.outline.jpg").c_str()).width(), 800);
}

TEST_F(OutputsTest, PhotosKeepTheInputsFormatUnlessAsked) {
  struct Case {
    const char* input;
    Layout layout;
    std::vector<std::string> extra;
    const char* photo;
    int bands;
  };
  const std::vector<Case> cases = {
      {"a.jpg", Layout::Rgb, {}, "a.photo.jpg", 3},
      {"b.tif", Layout::Rgb16, {}, "b.photo.tif", 3},
      {"c.webp", Layout::RgbAlpha, {}, "c.photo.webp", 4},
      {"d.png", Layout::GrayAlpha, {}, "d.photo.png", 2},
      {"e.png", Layout::RgbAlpha, {"--format", "jpg"}, "e.photo.jpg", 3},  // alpha flattened
      {"f.tif", Layout::Cmyk, {}, "f.photo.tif", 3},                       // now sRGB
      {"g.png", Layout::Rgb, {"--format", "webp"}, "g.photo.webp", 3},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.input);
    const std::string page = WritePageFile(c.input, c.layout);
    std::vector<std::string> args = {"crop", "--json", page, "-o", tmp_ / "out"};
    args.insert(args.end(), c.extra.begin(), c.extra.end());
    const RunOutcome r = Fringe(args);
    ASSERT_EQ(r.exitCode, 0) << r.err;
    EXPECT_EQ(OnlyLine(r)["photo"], tmp_ / (std::string("out/") + c.photo));
    const vips::VImage photo =
        vips::VImage::new_from_file((tmp_ / (std::string("out/") + c.photo)).c_str());
    EXPECT_EQ(photo.bands(), c.bands);
    EXPECT_EQ(photo.format(), VIPS_FORMAT_UCHAR);
  }
}

TEST_F(OutputsTest, PhotosKeepTheInputsColourProfile) {
  const std::string plain = WritePageFile("plain.png");
  // Tag the page with a profile of its own.
  const vips::VImage tagged =
      vips::VImage::new_from_file(plain.c_str())
          .icc_transform("srgb", vips::VImage::option()->set("input_profile", "srgb"));
  ASSERT_NE(tagged.get_typeof("icc-profile-data"), 0u);
  tagged.jpegsave((tmp_ / "tagged.jpg").c_str());
  const RunOutcome r = Fringe({"crop", "--json", tmp_ / "tagged.jpg", "-o", tmp_ / "out"});
  ASSERT_EQ(r.exitCode, 0) << r.err;
  const vips::VImage in = vips::VImage::new_from_file((tmp_ / "tagged.jpg").c_str());
  const vips::VImage out = vips::VImage::new_from_file((tmp_ / "out/tagged.photo.jpg").c_str());
  size_t inSize = 0, outSize = 0;
  const void* inData = in.get_blob("icc-profile-data", &inSize);
  ASSERT_NE(out.get_typeof("icc-profile-data"), 0u);
  const void* outData = out.get_blob("icc-profile-data", &outSize);
  ASSERT_EQ(inSize, outSize);
  EXPECT_EQ(std::memcmp(inData, outData, inSize), 0);
}

TEST_F(OutputsTest, FoldersAreMirroredAndPagesWithoutPhotoWriteNothing) {
  WritePageFile("in/x/one.png");
  WritePageFile("in/two.png", Layout::Rgb, 0.0, false);
  const RunOutcome r = Fringe({"all", "--json", "-q", tmp_ / "in", "-o", tmp_ / "out"});
  EXPECT_EQ(r.exitCode, 1) << r.err;
  EXPECT_TRUE(std::filesystem::exists(tmp_ / "out/x/one.outline.jpg"));
  EXPECT_TRUE(std::filesystem::exists(tmp_ / "out/x/one.photo.png"));
  EXPECT_FALSE(std::filesystem::exists(tmp_ / "out/two.outline.jpg"));
  EXPECT_FALSE(std::filesystem::exists(tmp_ / "out/two.photo.png"));
  EXPECT_TRUE(r.err.empty()) << r.err;  // -q
}

TEST_F(OutputsTest, OutputsThatCannotBeWrittenExit73) {
  const std::string page = WritePageFile("page.png");
  std::ofstream(tmp_ / "file") << "x";
  const RunOutcome r = Fringe({"crop", page, "-o", tmp_ / "file/out"});
  EXPECT_EQ(r.exitCode, 73);
  EXPECT_NE(r.err.find("file/out"), std::string::npos) << r.err;

  // A link inside the output folder that leads elsewhere is not followed.
  WritePageFile("in/sub/page.png");
  std::filesystem::create_directories(tmp_ / "out");
  std::filesystem::create_directories(tmp_ / "elsewhere");
  std::filesystem::create_directory_symlink(tmp_ / "elsewhere", tmp_ / "out/sub");
  const RunOutcome linked = Fringe({"crop", "--json", tmp_ / "in", "-o", tmp_ / "out"});
  EXPECT_EQ(linked.exitCode, 73) << linked.err;
  EXPECT_EQ(OnlyLine(linked)["error_kind"], "output");
  EXPECT_TRUE(std::filesystem::is_empty(tmp_ / "elsewhere"));
}

}  // namespace
}  // namespace FringeTest
