// The filter record, the about record and the tables as a module reads them,
// checked at the literal byte offsets of the host's interface.
#include <gtest/gtest.h>

#include "host_fixture.h"

namespace {

using Scripted::Read;
using Standin::Document;
using Standin::Proc;
using Standin::Table;

class RecordLayout : public ScriptedHostTest {
 protected:
  RecordLayout() : ScriptedHostTest(MakeDocument()) {}
  static Document MakeDocument() {
    Document document(640, 480, 3);
    document.filterRect = {50, 30, 450, 610};
    document.filterCase = 2;
    document.maxSpace = 3 << 20;
    return document;
  }
  const uint8_t* Record() { return host_.Record().Data(); }
};

TEST_F(RecordLayout, DocumentFieldsSitAtTheirOffsets) {
  host_.BeginRun();
  EXPECT_EQ(Read<int16_t>(Record(), 28), 480);
  EXPECT_EQ(Read<int16_t>(Record(), 30), 640);
  EXPECT_EQ(Read<int16_t>(Record(), 32), 3);
  EXPECT_EQ(Read<int16_t>(Record(), 34), 50);
  EXPECT_EQ(Read<int16_t>(Record(), 36), 30);
  EXPECT_EQ(Read<int16_t>(Record(), 38), 450);
  EXPECT_EQ(Read<int16_t>(Record(), 40), 610);
  EXPECT_EQ(Read<int32_t>(Record(), 56), 3 << 20);
  EXPECT_EQ(Read<int32_t>(Record(), 60), 0);
  EXPECT_EQ(Read<int16_t>(Record(), 156), 3);
  EXPECT_EQ(Read<int16_t>(Record(), 268), 2);
  EXPECT_EQ(Read<void*>(Record(), 88), nullptr);  // no buffers before advance state
  EXPECT_EQ(Read<void*>(Record(), 100), nullptr);
}

TEST_F(RecordLayout, TransparencyAddsAPlaneAndTheEditableTransparencyCase) {
  Document document(10, 20, 1, true);
  EXPECT_EQ(document.imageMode, 1);
  EXPECT_EQ(document.planes, 2);
  EXPECT_EQ(document.filterCase, 4);
  EXPECT_EQ(document.filterRect, (std::array<int32_t, 4>{0, 0, 20, 10}));
}

TEST_F(RecordLayout, EveryPointerAndTableIsInPlace) {
  host_.BeginRun();
  for (size_t offset : {4, 12, 216, 224, 232, 256, 280, 392, 432, 464, 472}) {
    EXPECT_NE(Read<void*>(Record(), offset), nullptr) << "offset " << offset;
  }
  const std::pair<size_t, int16_t> tables[] = {{224, 5}, {232, 4}, {256, 8}, {392, 2}};
  for (auto [offset, count] : tables) {
    void* table = Read<void*>(Record(), offset);
    EXPECT_EQ(Read<int16_t>(table, 2), count) << "table at " << offset;
    for (int position = 1; position <= count; ++position) {
      EXPECT_NE(Scripted::Proc<void (*)()>(table, position), nullptr)
          << "table at " << offset << " position " << position;
    }
  }
  void* block = Read<void*>(Record(), 432);
  EXPECT_EQ(Read<void*>(block, 8), nullptr);
  EXPECT_EQ(Read<int16_t>(Read<void*>(block, 16), 2), 4);
  void* basic = Read<void*>(Record(), 464);
  EXPECT_NE(Read<void*>(basic, 0), nullptr);
  EXPECT_NE(Read<void*>(basic, 8), nullptr);
  EXPECT_EQ(Read<void*>(Read<void*>(Record(), 216), 0), nullptr);  // no main window
}

TEST_F(RecordLayout, AboutRecordCarriesTheSameThreePointers) {
  host_.BeginRun();
  const uint8_t* seen = nullptr;
  Scripted::SetScript([&](int16_t selector, uint8_t* record, int16_t*) {
    if (selector == 0) seen = record;
  });
  EXPECT_EQ(host_.Call(0), 0);
  ASSERT_EQ(seen, host_.AboutRecord().Data());
  EXPECT_EQ(Read<void*>(seen, 0), Read<void*>(Record(), 216));
  EXPECT_EQ(Read<void*>(seen, 8), Read<void*>(Record(), 464));
  EXPECT_EQ(Read<void*>(seen, 16), Read<void*>(Record(), 472));
}

TEST_F(RecordLayout, FaultPlanShapesTheTables) {
  host_.Faults().Remove(Proc::HandleLock);
  host_.Faults().Remove(Proc::AdvanceState);
  host_.Faults().SetTable(Table::DataRecord, {.absent = false, .count = 3});
  host_.Faults().SetTable(Table::Property, {.absent = true, .count = std::nullopt});
  host_.Faults().SetTable(Table::DescriptorParameters, {.absent = true, .count = std::nullopt});
  host_.BeginRun();
  void* handles = Read<void*>(Record(), 256);
  EXPECT_EQ(Scripted::Proc<void (*)()>(handles, 5), nullptr);
  EXPECT_NE(Scripted::Proc<void (*)()>(handles, 6), nullptr);
  EXPECT_EQ(Read<void*>(Record(), 280), nullptr);
  EXPECT_EQ(Read<int16_t>(Read<void*>(Record(), 232), 2), 3);
  EXPECT_EQ(Read<void*>(Record(), 392), nullptr);
  EXPECT_EQ(Read<void*>(Record(), 432), nullptr);
}

TEST_F(RecordLayout, ModuleWritesAreReadBackAfterPrepare) {
  Scripted::SetScript([](int16_t selector, uint8_t* record, int16_t*) {
    if (selector == 2) {
      Scripted::Write<int32_t>(record, 56, 121500);
      Scripted::Write<int32_t>(record, 60, 0);
    }
  });
  Standin::RunReport report = host_.Run();
  EXPECT_EQ(report.maxSpaceAfterPrepare, 121500);
  EXPECT_EQ(report.bufferSpaceAfterPrepare, 0);
}

void SilentEntry(int16_t, void*, intptr_t* data, int16_t*) {
  *data = 1;
}

TEST(EntryWatch, UnwrittenResultAndWrittenDataSlotAreNoted) {
  auto module = Standin::Module::Wrap(&SilentEntry, "silent");
  Standin::Host host(*module, Document(30, 30, 1));
  host.BeginRun();
  host.Call(1);
  ASSERT_EQ(host.Problems().All().size(), 2u) << host.Problems().Text();
  EXPECT_NE(host.Problems().All()[0].find("result word unwritten"), std::string::npos);
  EXPECT_NE(host.Problems().All()[1].find("data slot"), std::string::npos);
}

}  // namespace
