// A run that a host ends at a failing continue, without finish: the filter
// object lives on into the next run, which may come from a host whose tables
// are all new. Nothing taken from the first run's record may be called then.
#include "e2e_support.h"
#include "standin/key_string_dictionary.h"

namespace {

using E2E::ModuleTest;
using E2E::RecordValues;
using Standin::Proc;

constexpr const char* kSuiteNames[] = {"HS KeyString Suite", "HS KeyString Dictionary Suite"};

class RunWithoutFinish : public ModuleTest {
 protected:
  // A host that translates alerts through the key-string suites, so that an
  // alert makes the module acquire suites through the basic suite.
  std::unique_ptr<Standin::Host> TranslatingHost(uint32_t seed) {
    auto host = MakeHost(E2E::PageDocument(E2E::PhotoPage(320, 240, 4.0, seed)));
    dictionary_.OfferThrough(host->Suites(), Standin::TranslationRoute::KeyStringSuites);
    return host;
  }

  Standin::KeyStringDictionary dictionary_;
};

TEST_F(RunWithoutFinish, AContinueThatRaisesGivesBackItsSuitesBeforeTheHostGoes) {
  auto first = TranslatingHost(1);
  first->Run({.continues = 0});
  const int32_t startAborts = first->AbortCalls();
  ASSERT_GT(startAborts, 0);

  // The abort test of continue raises: an alert, result 1, and a host that
  // stops there without finish.
  first->Faults().RaiseAt(Proc::Abort, startAborts + 1);
  Standin::RunReport report = first->Run();
  EXPECT_EQ(report.results[Standin::kContinue], 1);
  EXPECT_FALSE(report.called[Standin::kFinish]);
  EXPECT_EQ(TakeAlerts().size(), 1U);
  for (const char* name : kSuiteNames) {
    const Standin::SuiteUse use = first->Suites().Use(name, 1);
    EXPECT_GT(use.acquired, 0) << name;
    EXPECT_EQ(use.released, use.acquired) << name;
  }
  first.reset();  // every table of that host is gone

  // The surviving object serves a new host's run from start to finish,
  // calling only what this host offers.
  auto second = TranslatingHost(2);
  report = second->Run();
  EXPECT_EQ(report.results, (std::array<int16_t, 6>{}));
  EXPECT_EQ(RecordValues(*second).size(), 1U);
  EXPECT_EQ(RecordValues(*second)[0][8], 255);
  EXPECT_TRUE(second->LastDescriptor());
  ExpectClean(*second);

  // An alert in the new host's run acquires from that host, and finish
  // releases there.
  second->Faults().RaiseAt(Proc::Progress, 5);
  report = second->Run();
  EXPECT_EQ(report.results[Standin::kStart], 1);
  EXPECT_EQ(TakeAlerts().size(), 1U);
  for (const char* name : kSuiteNames) {
    const Standin::SuiteUse use = second->Suites().Use(name, 1);
    EXPECT_GT(use.acquired, 0) << name;
    EXPECT_EQ(use.released, use.acquired) << name;
  }
}

}  // namespace
