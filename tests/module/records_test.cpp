// Document data records, the result record, and the descriptor write pass.
#include <gtest/gtest.h>

#include <cstring>

#include "core/rastrix_error.h"
#include "core/service.h"
#include "filter/fringe_record.h"
#include "filter/result_keys.h"
#include "host/descriptor_write.h"
#include "host/four_char_code.h"
#include "host/rastrix_filter.h"
#include "support/fake_host.h"

namespace {

using FringeTest::FakeHost;
using FringeTest::Proc;
using Vireo::FourCharCode;

constexpr uint32_t kFringe = FourCharCode("fRNG");

class Plugin : public Vireo::CRastrixFilter {
 public:
  Plugin() : CRastrixFilter(0) {}
};

class RecordsTest : public ::testing::Test {
 protected:
  RecordsTest() {
    host_.SetDocument(480, 640, 3, 3);
    plugin_.AttachFilterRecord(&host_.record);
  }
  void TearDown() override {
    EXPECT_EQ(host_.doubleDisposals, 0);
    Vireo::ReleaseServices();
  }

  Project::CornerQuad Quad() {
    Project::CornerQuad quad;
    quad.corner[0] = {10, 20};
    quad.corner[1] = {11, 300};
    quad.corner[2] = {400, 301};
    quad.corner[3] = {-2, 19};
    return quad;
  }

  FakeHost host_;
  Plugin plugin_;
};

TEST_F(RecordsTest, TheRecordIsNineLittleEndianValues) {
  const Project::FringeRecord bytes = Project::MakeFringeRecord(Quad(), 255);
  const uint8_t expected[18] = {10, 0, 20, 0, 11, 0, 44, 1, 144, 1, 45, 1, 254, 255, 19, 0, 255, 0};
  EXPECT_EQ(std::memcmp(bytes.data(), expected, sizeof expected), 0);
}

TEST_F(RecordsTest, ThreeOldRecordsAreReplacedByOneNewOne) {
  host_.Records(kFringe).assign(3, std::vector<uint8_t>(18, 7));
  host_.Records(FourCharCode("othr")).assign(1, std::vector<uint8_t>(4, 1));
  Project::WriteFringeRecord(plugin_, Quad(), 127);
  int16_t values[9] = {};
  ASSERT_TRUE(host_.FringeRecordValues(values));
  EXPECT_EQ(values[0], 10);
  EXPECT_EQ(values[6], -2);
  EXPECT_EQ(values[8], 127);
  EXPECT_EQ(host_.Records(FourCharCode("othr")).size(), 1u);
  EXPECT_EQ(host_.LiveHandles(), 0u) << "the module disposes of its handle";
  // Deleted from the top down, so the indexes stay valid.
  const std::vector<std::string> deletions(host_.events.begin(), host_.events.begin() + 3);
  EXPECT_EQ(deletions, (std::vector<std::string>{"delete 3", "delete 2", "delete 1"}));
}

TEST_F(RecordsTest, ASlotWhoseGetAnswersNullIsSkipped) {
  host_.Records(kFringe).assign(3, std::vector<uint8_t>(18, 7));
  host_.NullSlots().insert(2);
  Project::WriteFringeRecord(plugin_, Quad(), 255);
  // Slot 2 stayed; it now sits first, before the new record.
  ASSERT_EQ(host_.Records(kFringe).size(), 2u);
  EXPECT_EQ(host_.Records(kFringe)[0], std::vector<uint8_t>(18, 7));
}

TEST_F(RecordsTest, ARecordTableOfThreeStoresNothingAndRaisesNothing) {
  host_.Records(kFringe).assign(1, std::vector<uint8_t>(18, 7));
  host_.recordProcs.SetCount(3);
  EXPECT_NO_THROW(Project::WriteFringeRecord(plugin_, Quad(), 255));
  EXPECT_EQ(host_.Records(kFringe).size(), 1u);
  EXPECT_EQ(host_.handlesCreated, 0);
}

TEST_F(RecordsTest, AFailedHandleRaisesMemoryFullAfterTheOldRecordsAreGone) {
  host_.Records(kFringe).assign(2, std::vector<uint8_t>(18, 7));
  host_.FailAt(Proc::kNewHandle, 1);
  try {
    Project::WriteFringeRecord(plugin_, Quad(), 255);
    ADD_FAILURE() << "no handle must raise";
  } catch (const Vireo::CRastrixError& error) {
    EXPECT_EQ(error.Code(), -108);
  }
  EXPECT_TRUE(host_.Records(kFringe).empty());
}

TEST_F(RecordsTest, ARefusedAddStillDisposesOfTheNewHandle) {
  host_.FailAt(Proc::kAddRecord, 1, -34);
  try {
    Project::WriteFringeRecord(plugin_, Quad(), 255);
    ADD_FAILURE() << "a refused record must raise the host's code";
  } catch (const Vireo::CRastrixError& error) {
    EXPECT_EQ(error.Code(), -34);
  }
  EXPECT_EQ(host_.handlesCreated, 1);
  EXPECT_EQ(host_.LiveHandles(), 0u);
}

TEST_F(RecordsTest, AHandleThatWillNotLockGivesNoRecordAndNoError) {
  host_.Records(kFringe).assign(1, std::vector<uint8_t>(18, 7));
  host_.FailAt(Proc::kLockHandle, 1);
  EXPECT_NO_THROW(Project::WriteFringeRecord(plugin_, Quad(), 255));
  EXPECT_TRUE(host_.Records(kFringe).empty());
  EXPECT_EQ(host_.LiveHandles(), 0u);
}

TEST_F(RecordsTest, TheFailureRecordCoversTheWholeDocument) {
  plugin_.OnParameters(&host_.record, &host_.dataSlot);
  Project::WriteEmptyFringeRecord(plugin_);
  int16_t values[9] = {};
  ASSERT_TRUE(host_.FringeRecordValues(values));
  const int16_t expected[9] = {0, 0, 0, 639, 479, 639, 479, 0, 0};
  EXPECT_EQ(std::memcmp(values, expected, sizeof values), 0);
}

TEST_F(RecordsTest, TheFailureRecordOfAnEmptyDocumentWrapsIn16Bits) {
  host_.record.documentSize = {0, -32768};
  Project::WriteEmptyFringeRecord(plugin_);
  int16_t values[9] = {};
  ASSERT_TRUE(host_.FringeRecordValues(values));
  EXPECT_EQ(values[3], 32767);
  EXPECT_EQ(values[4], -1);
}

class DescriptorTest : public RecordsTest {
 protected:
  Project::AnalysisResult result_ = [] {
    Project::AnalysisResult r;
    r.angle = -3.25;
    r.confidence = 127;
    r.corners.corner[0] = {1, 2};
    r.corners.corner[1] = {3, 4};
    r.corners.corner[2] = {5, 6};
    r.corners.corner[3] = {7, -8};
    return r;
  }();
  static const Project::AnalysisResult* current_;
  static bool PutKeys(Vireo::DescriptorParameters* parameters, void* token, int16_t& error) {
    return Project::PutResultKeysFrom(*current_, parameters, token, error);
  }
  bool Write(int16_t& error) {
    current_ = &result_;
    return Vireo::WriteDescriptor(host_.record.handleProcs, &host_.descriptorParameters, &PutKeys,
                                  error);
  }
};
const Project::AnalysisResult* DescriptorTest::current_ = nullptr;

TEST_F(DescriptorTest, TenKeysInOrderWithTheirKinds) {
  host_.descriptorParameters.recordInfo = 3;
  int16_t error = 99;
  EXPECT_TRUE(Write(error));
  EXPECT_EQ(error, 0);
  EXPECT_EQ(host_.descriptorParameters.recordInfo, 0);
  ASSERT_EQ(host_.descriptor.size(), 10u);
  EXPECT_EQ(host_.descriptor[0].key, FourCharCode("angl"));
  EXPECT_TRUE(host_.descriptor[0].isFloat);
  EXPECT_EQ(host_.descriptor[0].floatValue, -3.25);
  const char keys[][5] = {"conf", "pt1v", "pt1h", "pt2v", "pt2h", "pt3v", "pt3h", "pt4v", "pt4h"};
  const int32_t values[] = {127, 1, 2, 3, 4, 5, 6, 7, -8};
  for (size_t i = 0; i < 9; ++i) {
    const FringeTest::DescriptorKey& key = host_.descriptor[i + 1];
    EXPECT_EQ(key.key, FourCharCode(keys[i])) << keys[i];
    EXPECT_FALSE(key.isFloat) << keys[i];
    EXPECT_EQ(key.integerValue, values[i]) << keys[i];
  }
  EXPECT_TRUE(host_.IsLiveHandle(host_.descriptorParameters.descriptor));
}

TEST_F(DescriptorTest, TheOldDescriptorHandleGoesBeforeTheNewOneArrives) {
  void* old = FakeHost::NewHandle(8);
  host_.descriptorParameters.descriptor = old;
  int16_t error = 0;
  EXPECT_TRUE(Write(error));
  EXPECT_FALSE(host_.IsLiveHandle(old));
  ASSERT_GE(host_.events.size(), 2u);
  EXPECT_EQ(host_.events[host_.events.size() - 2],
            "dispose " + std::to_string(reinterpret_cast<uintptr_t>(old)));
  EXPECT_EQ(host_.events.back(), "close");
  EXPECT_NE(host_.descriptorParameters.descriptor, old);
}

TEST_F(DescriptorTest, OnlyTheLastPutCounts) {
  host_.FailAt(Proc::kPutFloat, 1, -50);
  int16_t error = 0;
  EXPECT_TRUE(Write(error));
  EXPECT_EQ(error, 0);
  EXPECT_EQ(host_.descriptor.size(), 9u);

  host_.FailAt(Proc::kPutInteger, 18, -50);  // 'pt4h' of this second pass
  EXPECT_FALSE(Write(error));
  EXPECT_EQ(error, 0) << "closing decides the error";
}

TEST_F(DescriptorTest, NoBlockOrNoWriteTableIsNotAnError) {
  int16_t error = 5;
  EXPECT_FALSE(Vireo::WriteDescriptor(host_.record.handleProcs, nullptr, &PutKeys, error));
  EXPECT_EQ(error, 0);
  host_.descriptorParameters.writeProcs = nullptr;
  error = 5;
  EXPECT_FALSE(Write(error));
  EXPECT_EQ(error, 0);
}

TEST_F(DescriptorTest, NoTokenIsMemoryFullAndACloseFailureIsItsCode) {
  host_.FailAt(Proc::kOpenDescriptor, 1);
  int16_t error = 0;
  EXPECT_FALSE(Write(error));
  EXPECT_EQ(error, -108);
  host_.FailAt(Proc::kCloseDescriptor, 1, -36);
  EXPECT_FALSE(Write(error));
  EXPECT_EQ(error, -36);
  EXPECT_EQ(host_.descriptorParameters.descriptor, nullptr);
}

}  // namespace
