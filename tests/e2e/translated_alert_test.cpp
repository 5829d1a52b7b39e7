// Error alerts in the host's language: the module resolves the alert's texts
// through whichever translation route the host offers, asks the host once per
// key in a run, and gives back every translated-string object it was handed.
#include "e2e_support.h"
#include "standin/key_string_dictionary.h"

namespace {

using E2E::ModuleTest;
using Standin::KeyStringDictionary;
using Standin::Proc;
using Standin::TranslationRoute;

const char* const kTitle = "$$$/Vireo/Reporter/Title=Error";
const char* const kDefault = "$$$/Vireo/Reporter/Default=The operation could not be completed.";

class TranslatedAlert : public ModuleTest, public ::testing::WithParamInterface<TranslationRoute> {
 protected:
  void SetUp() override {
    host_ = MakeHost(E2E::PageDocument(E2E::PhotoPage(300, 240, 5.0)));
    dictionary_.Add(kTitle, u"Fehler");
    dictionary_.Add(kDefault, u"Der Vorgang lie\u00DF sich nicht abschlie\u00DFen.");
  }
  // A host callback raising into the module makes start fail with an alert.
  Standin::RunReport FailingRun() {
    host_->Faults().RaiseAt(Proc::Progress, 10);
    return host_->Run();
  }

  std::unique_ptr<Standin::Host> host_;
  KeyStringDictionary dictionary_;
};

TEST_P(TranslatedAlert, ShowsTheHostsTextsAndAsksOncePerKeyInARun) {
  dictionary_.OfferThrough(host_->Suites(), GetParam());
  EXPECT_EQ(FailingRun().results[Standin::kStart], 1);
  EXPECT_EQ(TakeAlerts(), (std::vector<std::string>{
                              "ALERT\tFehler\tDer Vorgang lie\xC3\x9F sich nicht abschlie\xC3\x9F"
                              "en."}));
  EXPECT_EQ(dictionary_.Lookups(), 2);
  EXPECT_EQ(dictionary_.LiveObjects(), 0);
  ExpectClean(*host_);

  // A new run starts with an empty cache and asks again.
  EXPECT_EQ(FailingRun().results[Standin::kStart], 1);
  EXPECT_EQ(TakeAlerts().size(), 1U);
  EXPECT_EQ(dictionary_.Lookups(), 4);
  EXPECT_EQ(dictionary_.LiveObjects(), 0);
}

INSTANTIATE_TEST_SUITE_P(EveryRoute, TranslatedAlert,
                         ::testing::Values(TranslationRoute::KeyStringSuites,
                                           TranslationRoute::Utilities,
                                           TranslationRoute::SwiftView));

TEST_F(TranslatedAlert, KeysTheHostDoesNotKnowKeepTheirDefaultText) {
  KeyStringDictionary other;
  other.Add("$$$/Some/Other=Key", u"Anders");
  other.OfferThrough(host_->Suites(), TranslationRoute::KeyStringSuites);
  EXPECT_EQ(FailingRun().results[Standin::kStart], 1);
  EXPECT_EQ(TakeAlerts(),
            (std::vector<std::string>{"ALERT\tError\tThe operation could not be completed."}));
  EXPECT_EQ(other.Lookups(), 2);
}

TEST_F(TranslatedAlert, ASuccessfulRunAsksNothing) {
  dictionary_.OfferThrough(host_->Suites(), TranslationRoute::Utilities);
  Standin::RunReport report = host_->Run();
  EXPECT_EQ(report.results[Standin::kStart], 0);
  EXPECT_EQ(dictionary_.Lookups(), 0);
  EXPECT_TRUE(TakeAlerts().empty());
  ExpectClean(*host_);
}

}  // namespace
