// The module's memory set-up as the host sees it: the buffer suite asked for
// once per run and never left holding buffers, the scratch volumes read once
// with every handle given back, and hostile volume properties met safely
// (their other variants are covered in process by tests/memory).
#include "e2e_support.h"
#include "standin/fourcc.h"

namespace {

using E2E::ModuleTest;
using Standin::FourCC;
using Standin::Proc;

constexpr uint32_t kSignature = FourCC("9ZKT");

class HostMemory : public ModuleTest {
 protected:
  void SetUp() override { host_ = MakeHost(E2E::PageDocument(E2E::PhotoPage(300, 240, 5.0))); }

  void ExpectGoodRun() {
    Standin::RunReport report = host_->Run();
    for (int selector :
         {Standin::kParameters, Standin::kPrepare, Standin::kStart, Standin::kFinish}) {
      EXPECT_EQ(report.results[static_cast<size_t>(selector)], 0) << "selector " << selector;
    }
    EXPECT_EQ(host_->Records(E2E::kRecordType).size(), 1U);
    EXPECT_TRUE(TakeAlerts().empty());
    ExpectClean(*host_);
  }

  // Property reads of a run: 'UIBR' and 'LGTB' at creation, 'zScW' at start,
  // and what the memory set-up reads.
  int32_t MemoryPropertyReads() const { return host_->Calls(Proc::PropertyGet) - 3; }

  std::unique_ptr<Standin::Host> host_;
};

TEST_F(HostMemory, TakesTheBufferSuiteOncePerRunAndHoldsNoBuffersAfterIt) {
  ExpectGoodRun();
  const Standin::SuiteUse use =
      host_->Suites().Use(Standin::kBufferSuiteName, Standin::kBufferSuiteVersion);
  EXPECT_EQ(use.acquired, 1);
  EXPECT_EQ(use.released, 0);  // held outside the suite cache, never released
  EXPECT_EQ(host_->SuiteBuffers().Outstanding(), 0);
  ExpectGoodRun();
  EXPECT_EQ(host_->Suites().Use(Standin::kBufferSuiteName, Standin::kBufferSuiteVersion).acquired,
            2);
}

TEST_F(HostMemory, ReadsTheScratchVolumesOnceAndGivesEveryHandleBack) {
  host_->Properties().SetScratchVolumes({"C:\\Temp", "D:\\Scratch space"});
  ExpectGoodRun();
  EXPECT_EQ(MemoryPropertyReads(), 3);  // the count, then each path
}

TEST_F(HostMemory, AHugeVolumeCountReadsAtMostSixtyFourPaths) {
  host_->Properties().SetScratchVolumes({"C:\\Temp"});
  host_->Properties().Set(kSignature, FourCC("nusv"), 0, {intptr_t{1} << 40, std::nullopt});
  ExpectGoodRun();
  EXPECT_EQ(MemoryPropertyReads(), 1 + 64);
}

TEST_F(HostMemory, BrokenVolumeHandlesAreReadWithinTheirBytes) {
  host_->Properties().Set(kSignature, FourCC("nusv"), 0, {3, std::nullopt});
  host_->Properties().Set(kSignature, FourCC("svlp"), 0, {0, std::vector<uint8_t>{}});
  host_->Properties().Set(kSignature, FourCC("svlp"), 1,
                          {0, std::vector<uint8_t>(7, 0x41)});  // no terminator, odd size
  host_->Properties().Set(kSignature, FourCC("svlp"), 2, {0, std::nullopt});  // no handle
  ExpectGoodRun();
}

TEST_F(HostMemory, AHostWithoutTheBufferSuiteStillRuns) {
  host_->Suites().Withdraw(Standin::kBufferSuiteName, Standin::kBufferSuiteVersion);
  ExpectGoodRun();
  EXPECT_EQ(host_->SuiteBuffers().made, 0);
}

}  // namespace
