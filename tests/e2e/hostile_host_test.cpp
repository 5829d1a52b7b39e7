// A broken or hostile host: what the module can check it checks, and answers
// with the whole-document failure record instead of reading memory it was not
// given. Every case must run clean under the sanitizers too.
#include <algorithm>

#include "e2e_support.h"

namespace {

using E2E::FailureRecord;
using E2E::ModuleTest;
using E2E::RecordValues;
using Standin::ByteBlock;
using Standin::Delivery;
using Standin::Proc;
using Standin::Table;

constexpr int kWidth = 320, kHeight = 240;

class HostileHost : public ModuleTest {
 protected:
  void SetUp() override { host_ = MakeHost(E2E::PageDocument(E2E::PhotoPage(kWidth, kHeight, 4))); }

  // Runs every selector; expects start to answer 0, the failure record of the
  // document as announced, and nothing amiss on the host's side.
  void ExpectFailureRecord(int16_t rows = kHeight, int16_t columns = kWidth) {
    Standin::RunReport report = host_->Run({.stopOnFailure = false});
    EXPECT_EQ(report.results[Standin::kStart], 0);
    EXPECT_EQ(RecordValues(*host_),
              (std::vector<std::array<int16_t, 9>>{FailureRecord(rows, columns)}));
    ExpectClean(*host_);
  }

  std::unique_ptr<Standin::Host> host_;
};

TEST_F(HostileHost, NullInputBufferAfterASuccessfulAdvanceState) {
  host_->deliveryHook = [](Delivery& delivery, ByteBlock&) { delivery.inData = nullptr; };
  ExpectFailureRecord();
}

TEST_F(HostileHost, NullOutputBufferAfterASuccessfulAdvanceState) {
  host_->deliveryHook = [](Delivery& delivery, ByteBlock&) { delivery.outData = nullptr; };
  ExpectFailureRecord();
}

TEST_F(HostileHost, InputRectangleEmptiedOrReversedByTheHost) {
  for (int16_t bottom : {0, -5}) {
    host_->deliveryHook = [bottom](Delivery&, ByteBlock& record) {
      record.Put<int16_t>(64 + 4, bottom);  // the input rectangle's bottom
    };
    ExpectFailureRecord();
  }
}

TEST_F(HostileHost, RowDistanceShorterThanARowOfPixels) {
  host_->deliveryHook = [](Delivery& delivery, ByteBlock&) {
    delivery.inRowBytes = kWidth * 3 - 1;
  };
  ExpectFailureRecord();
  host_->deliveryHook = [](Delivery& delivery, ByteBlock&) {
    delivery.inRowBytes = -(kWidth * 3 - 1);
  };
  ExpectFailureRecord();
}

TEST_F(HostileHost, FewerPlanesThanTheImageModeHasChannels) {
  host_->Doc().planes = 2;  // an RGB document announcing two planes
  ExpectFailureRecord();
  host_->Doc().planes = 0;  // nothing to ask for at all
  ExpectFailureRecord();
}

TEST_F(HostileHost, ImageModeWithoutChannels) {
  for (int16_t mode : {7, 12, -1}) {
    host_->Doc().imageMode = mode;
    ExpectFailureRecord();
  }
}

TEST_F(HostileHost, FrameWiderOrTallerThan32767) {
  // The host claims success for an enormous frame but hands over a small
  // buffer: the module must refuse before reading it.
  std::vector<uint8_t> small(4096, 128);
  for (auto rect : {std::array<int32_t, 4>{0, -20000, kHeight, 20000},
                    std::array<int32_t, 4>{-20000, 0, 20000, kWidth}}) {
    host_->Doc().filterRect = rect;
    host_->deliveryHook = [&small](Delivery& delivery, ByteBlock&) {
      delivery.result = 0;
      delivery.inData = delivery.outData = small.data();
      delivery.inRowBytes = delivery.outRowBytes = 3;
      delivery.inColumnBytes = delivery.outColumnBytes = 3;
    };
    ExpectFailureRecord();
  }
}

TEST_F(HostileHost, OutputLaidOutUnlikeTheInputIsNotReadWrongly) {
  host_->outputLayout.columnPadding = 1;
  ExpectFailureRecord();
}

TEST_F(HostileHost, UnusualButValidLayoutsGiveTheSameAnswer) {
  host_->Run();
  auto expected = RecordValues(*host_);
  ASSERT_EQ(expected.size(), 1u);
  ASSERT_EQ(expected[0][8], 255);
  Standin::Descriptor descriptor = *host_->LastDescriptor();
  host_->inputLayout = {.rowPadding = 13, .columnPadding = 0, .bottomUp = true};
  host_->outputLayout = {.rowPadding = 5, .columnPadding = 0, .bottomUp = false};
  host_->Run();
  EXPECT_EQ(RecordValues(*host_), expected);
  ASSERT_TRUE(host_->LastDescriptor());
  EXPECT_EQ(host_->LastDescriptor()->Serialize(), descriptor.Serialize());
  ExpectClean(*host_);
}

TEST_F(HostileHost, MissingProceduresAreDoneWithoutOrAnsweredWithACode) {
  const Proc procs[] = {Proc::Abort,
                        Proc::Progress,
                        Proc::AdvanceState,
                        Proc::HandleNew,
                        Proc::HandleDispose,
                        Proc::HandleLock,
                        Proc::HandleUnlock,
                        Proc::RecordCount,
                        Proc::RecordGet,
                        Proc::RecordDelete,
                        Proc::RecordAdd,
                        Proc::PropertyGet,
                        Proc::DescriptorOpen,
                        Proc::DescriptorClose,
                        Proc::DescriptorPutInteger,
                        Proc::DescriptorPutFloat,
                        Proc::SuiteAcquire};
  for (Proc proc : procs) {
    host_->Faults().Remove(proc);
    Standin::RunReport report = host_->Run({.stopOnFailure = false});
    for (int16_t result : report.results) {
      EXPECT_TRUE(result <= 1) << Standin::ProcName(proc) << " missing: " << result;
    }
    EXPECT_LE(host_->Records(E2E::kRecordType).size(), 1u) << Standin::ProcName(proc);
    if (proc == Proc::DescriptorClose) {
      // The write pass opens before it can know that the token cannot be
      // closed; the token is the broken host's own loss.
      EXPECT_EQ(host_->Problems().Text(), "1 descriptor write token(s) opened and never closed\n");
    } else {
      ExpectClean(*host_);
    }
    host_->Faults().Restore(proc);
    host_->Problems().Clear();
  }
}

TEST_F(HostileHost, ADescriptorPutThatThrowsStillClosesItsToken) {
  // The angle is the one float; integers come before and after it.
  for (auto [put, call] :
       {std::pair{Proc::DescriptorPutInteger, 1}, std::pair{Proc::DescriptorPutInteger, 2},
        std::pair{Proc::DescriptorPutFloat, 1}}) {
    {
      host_->Faults().RaiseAt(put, call);
      Standin::RunReport report = host_->Run();
      EXPECT_EQ(std::count(report.results.begin(), report.results.end(), int16_t{1}), 1)
          << Standin::ProcName(put) << " " << call;
      // The incomplete descriptor is not handed over.
      EXPECT_FALSE(host_->LastDescriptor().has_value());
      EXPECT_EQ(host_->Calls(Proc::DescriptorClose), host_->Calls(Proc::DescriptorOpen));
      ExpectClean(*host_);
      EXPECT_EQ(TakeAlerts().size(), 1u);
      host_->Faults().Restore(put);
      host_->Faults().ResetCalls();
    }
  }
}

TEST_F(HostileHost, ALockThatThrowsWhilePublishingLosesNoHandle) {
  // The record's handle is the last one locked before it is published.
  host_->Run();
  const int32_t locks = host_->Calls(Proc::HandleLock);
  ASSERT_GT(locks, 0);
  host_->Faults().ResetCalls();
  host_->Faults().RaiseAt(Proc::HandleLock, locks);
  host_->Run();
  EXPECT_EQ(host_->Calls(Proc::HandleDispose), host_->Calls(Proc::HandleNew));
  ExpectClean(*host_);
  EXPECT_EQ(TakeAlerts().size(), 1u);
}

TEST_F(HostileHost, MissingOrEmptyTablesAreDoneWithout) {
  for (Table table :
       {Table::Handle, Table::DataRecord, Table::Property, Table::Buffer, Table::DescriptorWrite,
        Table::DescriptorParameters, Table::BasicSuite, Table::PlatformData}) {
    for (bool absent : {true, false}) {
      host_->Faults().SetTable(table, {.absent = absent, .count = int16_t{0}});
      Standin::RunReport report = host_->Run();
      EXPECT_EQ(report.results, (std::array<int16_t, 6>{}))
          << "table " << static_cast<int>(table) << (absent ? " absent" : " empty");
      ExpectClean(*host_);
      host_->Faults().SetTable(table, {});
    }
  }
}

}  // namespace
