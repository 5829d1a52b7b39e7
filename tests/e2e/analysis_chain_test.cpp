// Whole runs through ENTRYPOINT1 against the analysis chain run in memory on
// the same frame: the record and the descriptor must hold exactly what the
// chain leaves, the angle to the last bit.
#include <cstring>

#include "e2e_support.h"
#include "filter/analysis/driver.h"
#include "standin/fourcc.h"

namespace {

using Standin::FourCC;

// The host side of an in-memory run: no cancel, the records kept.
class MemoryHost : public Project::AnalysisHost {
 public:
  explicit MemoryHost(const Project::FrameView& frame) : frame_(frame) {}
  bool TestAbort() override { return false; }
  void ReportProgress(int32_t, int32_t) override {}
  void SetResultCode(int16_t code) override { code_ = code; }
  void WriteFringeRecord(const Project::CornerQuad& corners, int16_t confidence) override {
    for (size_t i = 0; i < 4; ++i) {
      record[2 * i] = corners.corner[i].v;
      record[2 * i + 1] = corners.corner[i].h;
    }
    record[8] = confidence;
  }
  void WriteEmptyFringeRecord() override {
    record = E2E::FailureRecord(frame_.documentRows, frame_.documentColumns);
  }
  std::array<int16_t, 9> record{-1, -1, -1, -1, -1, -1, -1, -1, -1};

 private:
  const Project::FrameView& frame_;
  int16_t code_ = 0;
};

// The chain over the whole page, laid out as the host delivers it.
void RunChain(const Synth::Page& page, const Synth::PageRecipe& recipe,
              Project::AnalysisResult& result, std::array<int16_t, 9>& record) {
  std::vector<uint8_t> input = page.pixels;
  std::vector<uint8_t> output = page.pixels;
  Project::FrameView frame;
  frame.imageMode = recipe.color ? 3 : 1;
  frame.filterCase = recipe.alpha ? 4 : 1;
  frame.planes = static_cast<int16_t>(page.channels);
  frame.documentRows = static_cast<int16_t>(page.height);
  frame.documentColumns = static_cast<int16_t>(page.width);
  frame.inRect = {0, 0, static_cast<int16_t>(page.height), static_cast<int16_t>(page.width)};
  frame.inData = input.data();
  frame.inRowBytes = page.width * page.channels;
  frame.inColumnBytes = page.channels;
  frame.outRect = frame.inRect;
  frame.outData = output.data();
  frame.outRowBytes = frame.inRowBytes;
  frame.outColumnBytes = frame.inColumnBytes;
  MemoryHost host(frame);
  Project::RunAnalysis(frame, host, result);
  record = host.record;
}

uint64_t Bits(double value) {
  uint64_t bits;
  std::memcpy(&bits, &value, sizeof bits);
  return bits;
}

using AnalysisChain = E2E::ModuleTest;

TEST_F(AnalysisChain, ModuleAnswersExactlyWhatTheChainComputes) {
  std::vector<Synth::PageRecipe> pages = {
      E2E::PhotoPage(900, 700, 11.0, 3), E2E::PhotoPage(700, 900, -23.5, 4),
      E2E::BlankPage(600, 400, 5),       E2E::PhotoPage(1200, 800, 0.0, 6),
      E2E::PhotoPage(500, 500, 35.0, 7),
  };
  pages[1].color = false;
  pages[3].alpha = true;
  pages[4].lidShadow = true;
  Synth::PageRecipe edge = E2E::PhotoPage(800, 600, 2.0, 8);
  edge.photo->centerX = 180;  // the photo runs off the left side
  pages.push_back(edge);

  // Both sides keep their result from page to page, as a loaded module does.
  Project::AnalysisResult chain;
  auto host = MakeHost(Standin::Document(1, 1, 1));
  for (size_t i = 0; i < pages.size(); ++i) {
    Synth::Page page = Synth::GeneratePage(pages[i]);
    std::array<int16_t, 9> record{};
    RunChain(page, pages[i], chain, record);

    host->Doc() = E2E::PageDocument(pages[i]);
    Standin::RunReport report = host->Run();
    ASSERT_EQ(report.results, (std::array<int16_t, 6>{})) << "page " << i;
    EXPECT_EQ(E2E::RecordValues(*host), (std::vector<std::array<int16_t, 9>>{record}))
        << "page " << i;
    ASSERT_TRUE(host->LastDescriptor()) << "page " << i;
    const Standin::Descriptor& descriptor = *host->LastDescriptor();
    EXPECT_EQ(Bits(*descriptor.Float(FourCC("angl"))), Bits(chain.angle)) << "page " << i;
    EXPECT_EQ(descriptor.Integer(FourCC("conf")), chain.confidence) << "page " << i;
    const char* keys[] = {"pt1v", "pt1h", "pt2v", "pt2h", "pt3v", "pt3h", "pt4v", "pt4h"};
    for (size_t k = 0; k < 8; ++k) {
      const Project::Point& corner = chain.corners.corner[k / 2];
      int32_t expected = k % 2 == 0 ? corner.v : corner.h;
      uint32_t key = (uint32_t(uint8_t(keys[k][0])) << 24) | (uint32_t(uint8_t(keys[k][1])) << 16) |
                     (uint32_t(uint8_t(keys[k][2])) << 8) | uint32_t(uint8_t(keys[k][3]));
      EXPECT_EQ(descriptor.Integer(key), expected) << "page " << i << " " << keys[k];
    }
    ExpectClean(*host);
  }
}

}  // namespace
