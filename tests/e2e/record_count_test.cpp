// A host whose record count answers a negative number: the module cannot
// know which records to replace, so it adds none and fails with that code.
#include "e2e_support.h"

namespace {

using E2E::ModuleTest;
using E2E::RecordValues;
using Standin::Proc;

class RecordCount : public ModuleTest {};

TEST_F(RecordCount, ANegativeCountFailsStartWithItAndAddsNoSecondRecord) {
  auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(320, 240, 3.0)));
  host->Run();
  const auto first = RecordValues(*host);
  ASSERT_EQ(first.size(), 1U);

  for (const int16_t garbage : {-109, -1}) {
    SCOPED_TRACE(garbage);
    host->Faults().FailAt(Proc::RecordCount, 1, 1, garbage);
    const int32_t adds = host->Calls(Proc::RecordAdd);
    const Standin::RunReport report = host->Run();
    EXPECT_EQ(report.results[Standin::kStart], garbage);
    EXPECT_FALSE(report.called[Standin::kFinish]);
    EXPECT_EQ(RecordValues(*host), first);
    EXPECT_EQ(host->Calls(Proc::RecordAdd), adds);
    ExpectClean(*host);
  }

  // A count that works again replaces the record as before.
  host->Faults().Restore(Proc::RecordCount);
  EXPECT_EQ(host->Run().results, (std::array<int16_t, 6>{}));
  EXPECT_EQ(RecordValues(*host).size(), 1U);
}

}  // namespace
