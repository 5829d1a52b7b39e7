// Whole filter runs through the entry function: what the filter asks of the
// host, what it publishes, and how a failure or a cancel carries through the
// selectors that follow.
#include <gtest/gtest.h>

#include <cstring>

#include "core/service.h"
#include "filter/analysis/driver.h"
#include "filter/module_result.h"
#include "host/dispatcher.h"
#include "host/entry_point.h"
#include "host/four_char_code.h"
#include "host/rastrix_filter.h"
#include "support/fake_host.h"
#include "support/test_environment.h"
#include "synth/page_generator.h"

namespace {

using FringeTest::FakeHost;
using FringeTest::Proc;
using Vireo::FourCharCode;

// The analysis's answer when it runs outside the module on the same frame.
class Witness : public Project::AnalysisHost {
 public:
  bool TestAbort() override { return false; }
  void ReportProgress(int32_t /*done*/, int32_t /*total*/) override {}
  void SetResultCode(int16_t /*code*/) override {}
  void WriteFringeRecord(const Project::CornerQuad& corners, int16_t confidence) override {
    const Project::CornerQuad& c = corners;
    record = {c.corner[0].v, c.corner[0].h, c.corner[1].v, c.corner[1].h, c.corner[2].v,
              c.corner[2].h, c.corner[3].v, c.corner[3].h, confidence};
  }
  void WriteEmptyFringeRecord() override { failed = true; }
  std::vector<int16_t> record;
  bool failed = false;
};

class FilterRunTest : public ::testing::Test {
 protected:
  void TearDown() override {
    Call(Vireo::kSelectorFinish);
    EXPECT_EQ(host_.doubleDisposals, 0);
    Vireo::ReleaseServices();
  }

  int16_t Call(int16_t selector) {
    int16_t result = 77;
    ENTRYPOINT1(selector, &host_.record, &host_.dataSlot, &result);
    return result;
  }

  // parameters, prepare, start, continue, finish: each selector's result.
  std::vector<int16_t> Run() {
    std::vector<int16_t> results;
    for (int16_t selector = 1; selector <= 5; ++selector) results.push_back(Call(selector));
    return results;
  }

  void LoadPage(const Synth::Page& page) {
    host_.SetDocument(static_cast<int16_t>(page.height), static_cast<int16_t>(page.width),
                      static_cast<int16_t>(page.channels), page.channels == 1 ? 1 : 3);
    host_.Pixels() = page.pixels;
  }

  std::vector<int16_t> RecordValues() {
    int16_t values[9] = {};
    if (!host_.FringeRecordValues(values)) return {};
    return {values, values + 9};
  }

  static Synth::Page PhotoPage(int width, int height, double angle) {
    Synth::PageRecipe recipe;
    recipe.width = width;
    recipe.height = height;
    recipe.photo = Synth::PhotoRecipe{width * 0.5, height * 0.5, width * 0.5, height * 0.45, angle};
    return Synth::GeneratePage(recipe);
  }

  FringeTest::AlertCapture alerts_;
  FakeHost host_;
};

const std::vector<int16_t> kAllSucceed = {0, 0, 0, 0, 0};

TEST_F(FilterRunTest, StartAsksForTheWholeAreaWithAllPlanesAndThenForNothing) {
  LoadPage(PhotoPage(120, 90, 0.0));
  host_.record.filterRect = {5, 6, 85, 116};
  ASSERT_EQ(Call(Vireo::kSelectorStart), 0);
  EXPECT_EQ(host_.advanceCalls, 1);
  EXPECT_EQ(host_.record.inLoPlane, 0);
  EXPECT_EQ(host_.record.inHiPlane, 2);
  EXPECT_EQ(host_.record.outLoPlane, 0);
  EXPECT_EQ(host_.record.outHiPlane, 2);
  EXPECT_EQ(host_.record.dataLayoutRequest, 1);
  EXPECT_EQ(host_.record.inputRate, 0x10000);
  EXPECT_EQ(host_.record.maskRate, 0x10000);
  // The frame delivered was the filter rectangle.
  EXPECT_EQ(host_.record.inRowBytes, 110 * 3);
  // Afterwards the filter asks for nothing more.
  const Vireo::HostRect empty{};
  EXPECT_EQ(std::memcmp(&host_.record.inRect, &empty, sizeof empty), 0);
  EXPECT_EQ(std::memcmp(&host_.record.outRect, &empty, sizeof empty), 0);
  EXPECT_EQ(std::memcmp(&host_.record.maskRect, &empty, sizeof empty), 0);
}

TEST_F(FilterRunTest, ACompleteRunPublishesWhatTheAnalysisFinds) {
  const Synth::Page page = PhotoPage(400, 300, 7.0);
  LoadPage(page);
  host_.record.filterRect = {50, 30, 300, 400};

  // The same frame analysed directly, starting from the module's last answer.
  const int width = 370;
  const int height = 250;
  std::vector<uint8_t> frame(static_cast<size_t>(width) * height * 3);
  for (int y = 0; y < height; ++y) {
    std::memcpy(&frame[static_cast<size_t>(y) * width * 3],
                &page.pixels[(static_cast<size_t>(y + 50) * 400 + 30) * 3],
                static_cast<size_t>(width) * 3);
  }
  std::vector<uint8_t> output = frame;
  Project::FrameView view;
  view.imageMode = 3;
  view.filterCase = 1;
  view.planes = 3;
  view.documentRows = 300;
  view.documentColumns = 400;
  view.inRect = view.outRect = {50, 30, 300, 400};
  view.inData = frame.data();
  view.outData = output.data();
  view.inRowBytes = view.outRowBytes = width * 3;
  view.inColumnBytes = view.outColumnBytes = 3;
  Witness witness;
  Project::AnalysisResult expected = Project::ModuleAnalysisResult();
  Project::RunAnalysis(view, witness, expected);
  ASSERT_FALSE(witness.failed);
  ASSERT_EQ(expected.confidence, 255);

  EXPECT_EQ(Run(), kAllSucceed);
  EXPECT_EQ(RecordValues(), witness.record);
  ASSERT_EQ(host_.descriptor.size(), 10u);
  EXPECT_EQ(host_.descriptor[0].floatValue, expected.angle);
  EXPECT_EQ(host_.descriptor[1].integerValue, 255);
  for (int k = 0; k < 8; ++k) {
    EXPECT_EQ(host_.descriptor[2 + k].integerValue, witness.record[k]) << k;
  }
  EXPECT_GT(host_.progress.size(), 100u);
  EXPECT_EQ(host_.LiveHandles(), 1u) << "only the descriptor the host collects";
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(FilterRunTest, AHostThatDoesNotReportTheOutputColumnDistanceIsReadLikeTheInput) {
  const Synth::Page page = PhotoPage(400, 300, 7.0);
  LoadPage(page);
  ASSERT_EQ(Run(), kAllSucceed);
  int16_t reported[9];
  ASSERT_TRUE(host_.FringeRecordValues(reported));
  ASSERT_EQ(reported[8], 255);

  host_.reportsOutputColumns = false;
  ASSERT_EQ(Run(), kAllSucceed);
  int16_t unreported[9];
  ASSERT_TRUE(host_.FringeRecordValues(unreported));
  for (int k = 0; k < 9; ++k) EXPECT_EQ(unreported[k], reported[k]) << k;
}

TEST_F(FilterRunTest, AFailedAdvanceStateWritesTheFailureRecordAndNoDescriptor) {
  host_.SetDocument(480, 640, 3, 3);
  host_.FailAt(Proc::kAdvanceState, 1, -108);
  EXPECT_EQ(Run(), (std::vector<int16_t>{0, 0, 0, 1, 0}));
  EXPECT_EQ(RecordValues(), (std::vector<int16_t>{0, 0, 0, 639, 479, 639, 479, 0, 0}));
  EXPECT_TRUE(host_.descriptor.empty());
  EXPECT_TRUE(host_.progress.empty());
}

TEST_F(FilterRunTest, AHostWithoutAdvanceStateGetsTheFailureRecord) {
  LoadPage(PhotoPage(120, 90, 0.0));
  int marker = 0;
  host_.record.inData = &marker;  // left from some earlier call; never to be read
  host_.record.advanceState = nullptr;
  EXPECT_EQ(Call(Vireo::kSelectorStart), 0);
  EXPECT_EQ(RecordValues(), (std::vector<int16_t>{0, 0, 0, 119, 89, 119, 89, 0, 0}));
  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);
  EXPECT_TRUE(host_.descriptor.empty());
}

TEST_F(FilterRunTest, ACancelDuringTheAnalysisLeavesNoDescriptor) {
  LoadPage(PhotoPage(200, 150, 3.0));
  host_.cancelFromCall = 1;
  EXPECT_EQ(Run(), (std::vector<int16_t>{0, 0, 0, 1, 0}));
  EXPECT_EQ(RecordValues().size(), 9u);
  EXPECT_TRUE(host_.descriptor.empty());
}

TEST_F(FilterRunTest, ACancelSeenAtContinueAfterACompleteAnalysis) {
  LoadPage(PhotoPage(200, 150, 3.0));
  ASSERT_EQ(Call(Vireo::kSelectorParameters), 0);
  ASSERT_EQ(Call(Vireo::kSelectorPrepare), 0);
  ASSERT_EQ(Call(Vireo::kSelectorStart), 0);
  const std::vector<int16_t> found = RecordValues();
  ASSERT_EQ(found.size(), 9u);
  ASSERT_EQ(found.back(), 255);
  host_.cancelFromCall = host_.abortCalls + 1;
  EXPECT_EQ(Call(Vireo::kSelectorContinue), 1);
  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);
  EXPECT_TRUE(host_.descriptor.empty());
}

TEST_F(FilterRunTest, AFailureCarriesIntoTheNextRunOfTheSameObject) {
  LoadPage(PhotoPage(200, 150, 3.0));
  ASSERT_EQ(Call(Vireo::kSelectorStart), 0);
  host_.cancelFromCall = host_.abortCalls + 1;
  ASSERT_EQ(Call(Vireo::kSelectorContinue), 1);  // the run ends here, without finish
  host_.cancelFromCall = 0;

  // The next run of the object writes the failure record without analysing.
  EXPECT_EQ(Call(Vireo::kSelectorParameters), 0);
  EXPECT_EQ(Call(Vireo::kSelectorPrepare), 0);
  EXPECT_EQ(Call(Vireo::kSelectorStart), 0);
  EXPECT_EQ(host_.advanceCalls, 1);
  EXPECT_EQ(RecordValues(), (std::vector<int16_t>{0, 0, 0, 199, 149, 199, 149, 0, 0}));
  EXPECT_EQ(Call(Vireo::kSelectorFinish), 0);
  EXPECT_TRUE(host_.descriptor.empty());

  // Finish cleared the code: a third run analyses again.
  EXPECT_EQ(Run(), kAllSucceed);
  EXPECT_EQ(host_.advanceCalls, 2);
  EXPECT_EQ(host_.descriptor.size(), 10u);
}

TEST_F(FilterRunTest, AFailingRecordStoreEndsTheRunWithTheHostsCode) {
  LoadPage(PhotoPage(200, 150, 3.0));
  host_.FailAt(Proc::kNewHandle, 1);
  EXPECT_EQ(Run(), (std::vector<int16_t>{0, 0, -108, 0, 0}));
  EXPECT_TRUE(host_.Records(FourCharCode("fRNG")).empty());
  EXPECT_TRUE(host_.descriptor.empty());
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(FilterRunTest, TwoRunsLeaveExactlyOneRecord) {
  LoadPage(PhotoPage(200, 150, 3.0));
  EXPECT_EQ(Run(), kAllSucceed);
  EXPECT_EQ(Run(), kAllSucceed);
  EXPECT_EQ(host_.Records(FourCharCode("fRNG")).size(), 1u);
}

TEST_F(FilterRunTest, AFlatPageKeepsThePreviousAngle) {
  LoadPage(PhotoPage(200, 150, 6.0));
  ASSERT_EQ(Run(), kAllSucceed);
  const double angle = host_.descriptor.at(0).floatValue;
  ASSERT_NE(angle, 0.0);

  Synth::PageRecipe blank;
  blank.width = 200;
  blank.height = 150;
  LoadPage(Synth::GeneratePage(blank));
  ASSERT_EQ(Run(), kAllSucceed);
  EXPECT_EQ(host_.descriptor.at(0).floatValue, angle);
  EXPECT_EQ(host_.descriptor.at(1).integerValue, 0);
}

int16_t DeliverNothing() {
  return 0;
}

TEST_F(FilterRunTest, AFrameDeliveredWithoutBuffersGetsTheFailureRecord) {
  LoadPage(PhotoPage(120, 90, 0.0));
  host_.record.advanceState = &DeliverNothing;  // success, but no buffers
  EXPECT_EQ(Run(), kAllSucceed);
  EXPECT_EQ(RecordValues(), (std::vector<int16_t>{0, 0, 0, 119, 89, 119, 89, 0, 0}));
  EXPECT_TRUE(alerts_.Lines().empty());
}

TEST_F(FilterRunTest, AHostOfferingNothingButTheDocumentGetsClearAnswers) {
  host_.SetDocument(100, 100, 1, 1);
  Vireo::FilterRecord bare{};
  bare.documentSize = host_.record.documentSize;
  bare.planes = 1;
  bare.imageMode = 1;
  bare.filterRect = host_.record.filterRect;
  std::vector<int16_t> results;
  for (int16_t selector = 1; selector <= 5; ++selector) {
    int16_t result = 77;
    ENTRYPOINT1(selector, &bare, nullptr, &result);
    results.push_back(result);
  }
  // No frame could be delivered: the run is a failure the user need not see.
  EXPECT_EQ(results, (std::vector<int16_t>{0, 0, 0, 1, 0}));
  EXPECT_EQ(Vireo::CRastrixFilter::Current(), nullptr);
  EXPECT_TRUE(alerts_.Lines().empty());
}

}  // namespace
