// fringe reports exactly what the stand-in host's own Detect reports for the
// same frame: corners and confidence from the 'fRNG' record, the angle from
// the descriptor, to the last bit.
#include <cstring>

#include "cli_fixture.h"
#include "page_loader.h"
#include "standin/detect.h"

namespace FringeTest {
namespace {

uint64_t Bits(double d) {
  uint64_t u = 0;
  std::memcpy(&u, &d, sizeof u);
  return u;
}

Standin::PageView ViewOf(const Fringe::DecodedPage& page) {
  return {page.width, page.height, page.channels, page.alpha, page.Pixels(), page.RowBytes()};
}

void ExpectSameAnswer(const nlohmann::json& line, const Standin::Detection& d) {
  ASSERT_TRUE(d.error.empty()) << d.error;
  ASSERT_TRUE(d.recordPresent);
  for (int k = 0; k < 4; ++k) {
    EXPECT_EQ(line["corners"][k][0], d.record[2 * k + 1]) << "corner " << k << " x";
    EXPECT_EQ(line["corners"][k][1], d.record[2 * k]) << "corner " << k << " y";
  }
  EXPECT_EQ(line["confidence"], d.record[8]);
  if (d.record[8] != 0) {
    ASSERT_TRUE(d.descriptorPresent);
    EXPECT_EQ(d.confidence, d.record[8]);
    for (int i = 0; i < 8; ++i) EXPECT_EQ(d.points[i], d.record[i]);
    EXPECT_EQ(Bits(line["angle"].get<double>()), Bits(d.angle)) << line.dump();
  }
}

std::string LayoutCaseName(const ::testing::TestParamInfo<Layout>& p) {
  return LayoutName(p.param);
}

class AgreementTest : public CliTest, public ::testing::WithParamInterface<Layout> {};

TEST_P(AgreementTest, ProgramAndHostGiveTheSameAnswerForTheSameFrame) {
  const Layout layout = GetParam();
  auto module = Standin::Module::Load(FringeModule(), true);
  for (double angle : {-13.0, 2.5, 21.0}) {
    SCOPED_TRACE(angle);
    const std::string ext = layout == Layout::Cmyk ? "jpg" : "png";
    const std::string path = WritePageFile("page." + ext, layout, angle);
    const RunOutcome r = Fringe({"detect", "--json", path});
    ASSERT_EQ(r.exitCode, 0) << r.err;
    const nlohmann::json line = OnlyLine(r);

    const Fringe::DecodedPage page = Fringe::LoadPage(path, {1u << 30, 0});
    ExpectSameAnswer(line, Standin::Detect(*module, ViewOf(page)));

    const bool exact = layout != Layout::Cmyk && layout != Layout::Palette;
    if (exact) {
      // Lossless layouts decode to the very bytes that were generated (16-bit
      // samples keep their high byte), so the host sees the generated page.
      ASSERT_EQ(page.image.bands(), last_.channels);
      for (int y = 0; y < page.height; y += 37) {
        ASSERT_EQ(
            std::memcmp(page.Pixels() + y * page.RowBytes(),
                        last_.pixels.data() + static_cast<size_t>(y) * last_.width * last_.channels,
                        static_cast<size_t>(last_.width) * last_.channels),
            0)
            << "row " << y;
      }
      const Standin::PageView raw{
          last_.width,         last_.height,
          page.channels,       page.alpha,
          last_.pixels.data(), static_cast<std::ptrdiff_t>(last_.width) * last_.channels};
      ExpectSameAnswer(line, Standin::Detect(*module, raw));
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Layouts, AgreementTest,
                         ::testing::Values(Layout::Rgb, Layout::Gray, Layout::Rgb16, Layout::Gray16,
                                           Layout::RgbAlpha, Layout::GrayAlpha, Layout::Palette,
                                           Layout::Cmyk),
                         LayoutCaseName);

TEST_F(AgreementTest, PagesWithoutAPhotoReportTheModulesWholePageRecord) {
  auto module = Standin::Module::Load(FringeModule(), true);
  const std::string path = WritePageFile("blank.png", Layout::Rgb, 0.0, false);
  const RunOutcome r = Fringe({"detect", "--json", path});
  EXPECT_EQ(r.exitCode, 1) << r.err;
  const nlohmann::json line = OnlyLine(r);
  EXPECT_EQ(line["status"], "not_found");
  EXPECT_EQ(line["angle"], 0.0);
  const Fringe::DecodedPage page = Fringe::LoadPage(path, {1u << 30, 0});
  ExpectSameAnswer(line, Standin::Detect(*module, ViewOf(page)));
}

}  // namespace
}  // namespace FringeTest
