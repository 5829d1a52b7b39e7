// The filter's job through ENTRYPOINT1: its memory claim, the 'fRNG' record it
// keeps with the document, the result descriptor, progress, and the corners in
// document coordinates.
#include <algorithm>
#include <cstring>

#include "../standin/scripted_module.h"
#include "e2e_support.h"
#include "standin/fourcc.h"

namespace {

using E2E::FailureRecord;
using E2E::ModuleTest;
using E2E::RecordValues;
using Standin::FourCC;
using Standin::Proc;

using Filter = ModuleTest;

std::vector<uint8_t> OldRecord(uint8_t mark) {
  return std::vector<uint8_t>(18, mark);
}

uint64_t Bits(double value) {
  uint64_t bits;
  std::memcpy(&bits, &value, sizeof bits);
  return bits;
}

TEST_F(Filter, ClaimsTwoBytesPerPlaneAndPixelPlusFivePerRowAndColumn) {
  Standin::Document document(200, 100, 3);
  auto host = MakeHost(std::move(document));
  Standin::RunReport report = host->Run({.start = false, .continues = 0});
  EXPECT_EQ(report.maxSpaceAfterPrepare, 121500);
  EXPECT_EQ(report.bufferSpaceAfterPrepare, 0);

  host->Doc() = Standin::Document(20000, 20000, 1);
  report = host->Run({.start = false, .continues = 0});
  EXPECT_EQ(report.maxSpaceAfterPrepare, 800200000);
  ExpectClean(*host);
}

TEST_F(Filter, ClaimTooLargeFor32BitsSaturates) {
  auto host = MakeHost(Standin::Document(30000, 30000, 3));
  Standin::RunReport report = host->Run({.start = false, .continues = 0});
  EXPECT_EQ(report.maxSpaceAfterPrepare, 2147483647);
  ExpectClean(*host);
}

TEST_F(Filter, FailedAdvanceStateLeavesTheWholeDocumentRecordAndNoDescriptor) {
  auto host = MakeHost(Standin::Document(640, 480, 3));
  host->Faults().FailAt(Proc::AdvanceState, 1, 1, -43);
  Standin::RunReport report = host->Run({.stopOnFailure = false});
  // The host's error stays with the object: continue answers 1, finish writes nothing.
  EXPECT_EQ(report.results, (std::array<int16_t, 6>{0, 0, 0, 0, 1, 0}));
  EXPECT_EQ(RecordValues(*host),
            (std::vector<std::array<int16_t, 9>>{{0, 0, 0, 639, 479, 639, 479, 0, 0}}));
  EXPECT_FALSE(host->LastDescriptor());
  EXPECT_TRUE(host->ProgressCalls().empty());
  ExpectClean(*host);
}

TEST_F(Filter, CompleteRunPublishesOneRecordAndTheTenKeysInOrder) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(800, 600, -6.0)));
  for (uint8_t mark : {1, 2, 3}) host->Doc().Store().Add(E2E::kRecordType, OldRecord(mark));
  host->Doc().Store().Add(FourCC("othr"), OldRecord(9));
  Standin::RunReport report = host->Run();
  EXPECT_EQ(report.results, (std::array<int16_t, 6>{}));
  auto records = RecordValues(*host);
  ASSERT_EQ(records.size(), 1u);
  EXPECT_EQ(records[0][8], 255);
  EXPECT_EQ(host->Records(FourCC("othr")).size(), 1u);  // other types untouched

  ASSERT_TRUE(host->LastDescriptor());
  const Standin::Descriptor& descriptor = *host->LastDescriptor();
  std::vector<uint32_t> keys;
  for (const char* key :
       {"angl", "conf", "pt1v", "pt1h", "pt2v", "pt2h", "pt3v", "pt3h", "pt4v", "pt4h"}) {
    keys.push_back((uint32_t(uint8_t(key[0])) << 24) | (uint32_t(uint8_t(key[1])) << 16) |
                   (uint32_t(uint8_t(key[2])) << 8) | uint32_t(uint8_t(key[3])));
  }
  EXPECT_EQ(descriptor.Keys(), keys);
  EXPECT_EQ(descriptor.Integer(keys[1]), records[0][8]);
  for (size_t i = 0; i < 8; ++i) EXPECT_EQ(descriptor.Integer(keys[2 + i]), records[0][i]) << i;
  EXPECT_NEAR(*descriptor.Float(keys[0]), -6.0, 0.5);
  EXPECT_EQ(Scripted::Read<int16_t>(host->DescriptorBlock().Data(), 4), 0);
  ExpectClean(*host);

  // A second run over the same document still leaves exactly one.
  host->Run();
  EXPECT_EQ(RecordValues(*host), records);
  ExpectClean(*host);
}

TEST_F(Filter, RecordSlotWhoseGetAnswersNullIsSkipped) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(400, 300, 3.0)));
  for (uint8_t mark : {1, 2, 3}) host->Doc().Store().Add(E2E::kRecordType, OldRecord(mark));
  host->Faults().FailAt(Proc::RecordGet, 2);  // the walk runs 3, 2, 1: slot 2 answers null
  host->Run();
  auto records = host->Records(E2E::kRecordType);
  ASSERT_EQ(records.size(), 2u);
  EXPECT_EQ(records[0], OldRecord(2));
  EXPECT_EQ(RecordValues(*host)[1][8], 255);
  ExpectClean(*host);
}

TEST_F(Filter, DataRecordTableOfCountThreeGivesNoRecordAndNoError) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(400, 300, 3.0)));
  host->Doc().Store().Add(E2E::kRecordType, OldRecord(1));
  host->Faults().SetTable(Standin::Table::DataRecord, {.absent = false, .count = 3});
  Standin::RunReport report = host->Run();
  EXPECT_EQ(report.results, (std::array<int16_t, 6>{}));
  EXPECT_EQ(host->Records(E2E::kRecordType), (std::vector<std::vector<uint8_t>>{OldRecord(1)}));
  EXPECT_TRUE(host->LastDescriptor());
  EXPECT_EQ(host->Calls(Proc::RecordCount), 0);
  ExpectClean(*host);
}

TEST_F(Filter, HandleTheHostCannotGiveEndsStartWithMemoryFull) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(400, 300, 3.0)));
  for (uint8_t mark : {1, 2}) host->Doc().Store().Add(E2E::kRecordType, OldRecord(mark));
  host->Faults().FailAt(Proc::HandleNew, 1);
  Standin::RunReport report = host->Run({.stopOnFailure = false});
  EXPECT_EQ(report.results[Standin::kStart], -108);
  EXPECT_EQ(report.results[Standin::kContinue], 0);  // no object left to answer
  EXPECT_TRUE(host->Records(E2E::kRecordType).empty());
  EXPECT_FALSE(host->LastDescriptor());
  ExpectClean(*host);
}

TEST_F(Filter, RefusedAddStillDisposesTheNewHandle) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(400, 300, 3.0)));
  host->Faults().FailAt(Proc::RecordAdd, 1, 1, -34);
  Standin::RunReport report = host->Run();
  EXPECT_EQ(report.results[Standin::kStart], -34);
  EXPECT_TRUE(host->Records(E2E::kRecordType).empty());
  ExpectClean(*host);  // a handle left behind would show here as a leak
  EXPECT_EQ(host->Handles().Live(Standin::HandleOwner::Module).size(), 0u);
}

TEST_F(Filter, EarlierDescriptorInTheBlockIsReleasedBeforeTheNewOneArrives) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(400, 300, 3.0)));
  host->BeginRun();
  Standin::Descriptor old;
  old.PutInteger(FourCC("conf"), 7);
  void* seeded = host->SeedDescriptorHandle(old);
  for (int16_t selector : {1, 2, 3, 4, 5}) ASSERT_EQ(host->Call(selector), 0);
  host->CheckRunEnd();
  ExpectClean(*host);
  const Standin::HandleInfo* info = host->Handles().Find(seeded);
  EXPECT_FALSE(info->live);
  const auto& events = host->Events();
  auto disposal = std::find_if(events.begin(), events.end(), [&](const Standin::CallEvent& e) {
    return e.proc == Proc::HandleDispose && e.handle == info->id;
  });
  auto close = std::find_if(events.begin(), events.end(), [](const Standin::CallEvent& e) {
    return e.proc == Proc::DescriptorClose;
  });
  ASSERT_NE(disposal, events.end());
  ASSERT_NE(close, events.end());
  EXPECT_LT(disposal - events.begin(), close - events.begin());
  EXPECT_EQ(host->LastDescriptor()->Keys().size(), 10u);
}

TEST_F(Filter, FailedAngleFollowedByGoodPutsStillWritesTheDescriptor) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(400, 300, 3.0)));
  host->Faults().FailAt(Proc::DescriptorPutFloat, 1, 1, -1);
  Standin::RunReport report = host->Run();
  EXPECT_EQ(report.results[Standin::kFinish], 0);
  ASSERT_TRUE(host->LastDescriptor());
  EXPECT_EQ(host->LastDescriptor()->Keys().size(), 9u);
  EXPECT_FALSE(host->LastDescriptor()->Float(FourCC("angl")));
  EXPECT_EQ(host->LastDescriptor()->Integer(FourCC("conf")), 255);
  ExpectClean(*host);
}

TEST_F(Filter, ProgressCountsStepsAgainstAFixedTotal) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(1000, 800, 4.0)));
  host->Run();
  ASSERT_EQ(RecordValues(*host).size(), 1u);
  ASSERT_EQ(RecordValues(*host)[0][8], 255);  // the second half ran and succeeded
  const auto& progress = host->ProgressCalls();
  ASSERT_EQ(progress.size(), static_cast<size_t>(2 * 1000 + 4 * 800 - 65));
  for (size_t i = 0; i < progress.size(); ++i) {
    ASSERT_EQ(progress[i], std::make_pair(static_cast<int32_t>(i + 1), 5167)) << i;
  }
  ExpectClean(*host);
}

TEST_F(Filter, FlatPageGivesTheWholePageAndKeepsThePreviousAngle) {
  auto host = MakeHost(E2E::PageDocument(E2E::BlankPage(500, 400)));
  host->Run();
  EXPECT_EQ(RecordValues(*host), (std::vector<std::array<int16_t, 9>>{FailureRecord(400, 500)}));
  EXPECT_EQ(host->ProgressCalls().size(), static_cast<size_t>(2 * 400 + 3));
  ASSERT_TRUE(host->LastDescriptor());
  EXPECT_EQ(Bits(*host->LastDescriptor()->Float(FourCC("angl"))), Bits(0.0));  // fresh module
  EXPECT_EQ(host->LastDescriptor()->Integer(FourCC("conf")), 0);

  host->Doc() = E2E::PageDocument(E2E::PhotoPage(500, 400, 9.0));
  host->Run();
  double angle = *host->LastDescriptor()->Float(FourCC("angl"));
  EXPECT_NEAR(angle, 9.0, 0.5);

  host->Doc() = E2E::PageDocument(E2E::BlankPage(500, 400, 2));
  host->Run();
  EXPECT_EQ(Bits(*host->LastDescriptor()->Float(FourCC("angl"))), Bits(angle));
  EXPECT_EQ(host->LastDescriptor()->Integer(FourCC("conf")), 0);
  ExpectClean(*host);
}

TEST_F(Filter, CornersComeBackInDocumentCoordinates) {
  Synth::PageRecipe recipe = E2E::PhotoPage(600, 450, -5.0);
  auto plain = MakeHost(E2E::PageDocument(recipe));
  plain->Run();
  ASSERT_EQ(RecordValues(*plain).size(), 1u);
  std::array<int16_t, 9> expected = RecordValues(*plain)[0];
  for (size_t i = 0; i < 8; i += 2) {
    expected[i] = static_cast<int16_t>(expected[i] + 50);
    expected[i + 1] = static_cast<int16_t>(expected[i + 1] + 30);
  }
  double angle = *plain->LastDescriptor()->Float(FourCC("angl"));

  // The same page inside a larger document, selected from top 50, left 30.
  Synth::Page page = Synth::GeneratePage(recipe);
  Standin::Document document(600 + 80, 450 + 90, 3);
  std::vector<uint8_t> pixels(static_cast<size_t>(680 * 540 * 3), 255);
  for (int y = 0; y < 450; ++y) {
    std::memcpy(&pixels[static_cast<size_t>(((50 + y) * 680 + 30) * 3)],
                &page.pixels[static_cast<size_t>(y * 600 * 3)], 600 * 3);
  }
  document.SetPixels(std::move(pixels), 680 * 3);
  document.filterRect = {50, 30, 500, 630};
  document.filterCase = 2;
  auto offset = MakeHost(std::move(document));
  offset->Run();
  EXPECT_EQ(RecordValues(*offset), (std::vector<std::array<int16_t, 9>>{expected}));
  EXPECT_EQ(Bits(*offset->LastDescriptor()->Float(FourCC("angl"))), Bits(angle));
  EXPECT_EQ(offset->LastDescriptor()->Integer(FourCC("pt1v")), expected[0]);
  EXPECT_EQ(offset->LastDescriptor()->Integer(FourCC("pt4h")), expected[7]);
  ExpectClean(*plain);
  ExpectClean(*offset);
}

}  // namespace
