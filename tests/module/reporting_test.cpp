// The exception family's texts, the reporter's message layout and the
// framework services' life.
#include <gtest/gtest.h>

#include <stdexcept>

#include "core/error.h"
#include "core/rastrix_error.h"
#include "core/reporter.h"
#include "core/resolve_text.h"
#include "core/service.h"
#include "core/system_error.h"
#include "support/test_environment.h"

namespace {

using Vireo::CText;

std::string Resolved(CText text) {
  Vireo::ResolveText(text);
  return text.Utf8();
}

std::string ReasonOf(const Vireo::CException& exception) {
  CText reason;
  exception.GetReason(reason);
  return Resolved(reason);
}

std::string TaskOf(const Vireo::CException& exception) {
  CText task;
  exception.GetTask(task);
  return Resolved(task);
}

TEST(ExceptionTextTest, HostCodesHaveTheirMessagesAndUnknownCodesTheLastRow) {
  EXPECT_EQ(ReasonOf(Vireo::CRastrixError(-108)), "There is not enough memory.");
  EXPECT_EQ(ReasonOf(Vireo::CRastrixError(-128)), "The operation was canceled.");
  EXPECT_EQ(ReasonOf(Vireo::CRastrixError(-50)), "There is an error in the parameter list.");
  EXPECT_EQ(ReasonOf(Vireo::CRastrixError(-19)), "The data could not be read.");
  EXPECT_EQ(ReasonOf(Vireo::CRastrixError(-1)), "An unknown host error has occurred.");
  EXPECT_EQ(ReasonOf(Vireo::CRastrixError(0)), "An unknown host error has occurred.");
  EXPECT_EQ(TaskOf(Vireo::CRastrixError(-108)), "The operation could not be completed.");
  EXPECT_STREQ(Vireo::RastrixErrorMessage(-111),
               "$$$/Vireo/RastrixError/memWZErr=An attempt was made to operate on a free memory "
               "block.");
}

TEST(ExceptionTextTest, AbortAndSystemAndDebugErrorsDescribeThemselves) {
  const Vireo::CAbort abort(true, false);
  EXPECT_TRUE(abort.IsSilent());
  EXPECT_FALSE(abort.ShowsAlert());
  EXPECT_EQ(TaskOf(abort), "The operation was not completed.");
  EXPECT_EQ(ReasonOf(abort), "The operation has been canceled.");

  EXPECT_EQ(ReasonOf(Vireo::CSystemError(0)), "An unknown operating system error has occurred.");
  EXPECT_FALSE(ReasonOf(Vireo::CSystemError(2)).empty());

  EXPECT_EQ(TaskOf(Vireo::CDebugError("", "", 0)), "An unknown debugging error was generated.");
  EXPECT_EQ(ReasonOf(Vireo::CDebugError("", "", 0)), "File not specified.");
  EXPECT_EQ(TaskOf(Vireo::CDebugError("Bad state", "a.cpp", 12)), "Bad state");
  EXPECT_EQ(ReasonOf(Vireo::CDebugError("Bad state", "a.cpp", 12)), "File a.cpp, Line 12.");
}

TEST(ExceptionTextTest, ErrorsTakeOverTextsAndFlags) {
  const Vireo::CError reasonOnly = Vireo::CError::WithReason("$$$/T/R=Why.");
  EXPECT_EQ(TaskOf(reasonOnly), "");
  EXPECT_EQ(ReasonOf(reasonOnly), "Why.");
  EXPECT_FALSE(reasonOnly.IsSilent());
  EXPECT_TRUE(reasonOnly.ShowsAlert());

  const Vireo::CError copied(Vireo::CAbort(true, false));
  EXPECT_TRUE(copied.IsSilent());
  EXPECT_FALSE(copied.ShowsAlert());
  EXPECT_EQ(TaskOf(copied), "The operation was not completed.");
  EXPECT_EQ(ReasonOf(copied), "The operation has been canceled.");

  const Vireo::CError retasked("$$$/T/T=Saving.", Vireo::CRastrixError(-34));
  EXPECT_EQ(TaskOf(retasked), "Saving.");
  EXPECT_EQ(ReasonOf(retasked), "The disk is full.");

  const Vireo::CError fromStandard{std::runtime_error("internal detail")};
  EXPECT_EQ(TaskOf(fromStandard), "");
  EXPECT_EQ(ReasonOf(fromStandard), "");
  EXPECT_TRUE(fromStandard.ShowsAlert());

  const Vireo::CError flagsOnly(true, false);
  EXPECT_TRUE(flagsOnly.IsSilent());
  EXPECT_FALSE(flagsOnly.ShowsAlert());

  Vireo::CError changed = Vireo::CError::WithTask("One.");
  changed.SetReason("Two.");
  EXPECT_EQ(ReasonOf(changed), "Two.");
}

TEST(TextTest, LiteralsKeepOnlySevenBitBytes) {
  EXPECT_EQ(CText("caf\xc3\xa9").Utf8(), "caf??");
  EXPECT_EQ(CText::FromUtf8("caf\xc3\xa9").Utf8(), "caf\xc3\xa9");
  EXPECT_EQ(CText::FromUtf8("caf\xc3\xa9").CharacterLength(), 4u);
}

TEST(TextTest, KeyStringsResolveToTheirDefaultText) {
  EXPECT_EQ(Resolved("$$$/Vireo/Reporter/Title=Error"), "Error");
  EXPECT_EQ(Resolved("$$$/Only/A/Key"), "");
  EXPECT_EQ(Resolved("$$/Not/A/Key=Text"), "$$/Not/A/Key=Text");
  EXPECT_EQ(Resolved("$$$=Text"), "");  // an empty key resolves to nothing
  EXPECT_EQ(Resolved("plain"), "plain");
}

class ReporterTest : public ::testing::Test {
 protected:
  void TearDown() override { Vireo::ReleaseServices(); }
  std::vector<std::string> Report(const Vireo::CException& exception) {
    Vireo::CServiceT<Vireo::CReporter>::Get().Report(exception);
    return alerts_.Lines();
  }
  FringeTest::AlertCapture alerts_;
};

TEST_F(ReporterTest, AReasonAloneStandsAsTheMessageWithoutLineBreaks) {
  const std::vector<std::string> expected = {"ALERT\tError\tThe page is gone."};
  EXPECT_EQ(Report(Vireo::CError::WithReason("$$$/T/R=The page is gone.")), expected);
}

TEST_F(ReporterTest, AHostCodeIsShownUnderTheGeneralTask) {
  const std::vector<std::string> expected = {
      "ALERT\tError\tThe operation could not be completed.\\n\\nAn unknown host error has "
      "occurred."};
  EXPECT_EQ(Report(Vireo::CRastrixError(-1)), expected);
}

TEST_F(ReporterTest, NoTextsAtAllShowTheDefault) {
  const std::vector<std::string> expected = {"ALERT\tError\tThe operation could not be completed."};
  EXPECT_EQ(Report(Vireo::CError(false, true)), expected);
}

TEST_F(ReporterTest, TheDefaultReportShowsTheGeneralTask) {
  Vireo::CServiceT<Vireo::CReporter>::Get().ReportDefault();
  const std::vector<std::string> expected = {"ALERT\tError\tThe operation could not be completed."};
  EXPECT_EQ(alerts_.Lines(), expected);
}

TEST_F(ReporterTest, ComposingKeepsKeyStringsForTheCaller) {
  CText task;
  CText reason;
  Vireo::ComposeReport(Vireo::CError(false, true), task, reason);
  EXPECT_EQ(task.Utf8(), "$$$/Vireo/Reporter/Default=The operation could not be completed.");
  EXPECT_TRUE(reason.IsEmpty());
}

// A service whose destruction asks for another service.
struct Chained {
  static int destroyed;
  ~Chained();
};
int Chained::destroyed = 0;
struct Dependent {
  static int destroyed;
  ~Dependent() { ++destroyed; }
};
int Dependent::destroyed = 0;
Chained::~Chained() {
  ++destroyed;
  Vireo::CServiceT<Dependent>::Get();
}

TEST(ServiceTest, OneInstanceUntilReleasedThenAFreshOne) {
  Vireo::CReporter& first = Vireo::CServiceT<Vireo::CReporter>::Get();
  EXPECT_EQ(&first, &Vireo::CServiceT<Vireo::CReporter>::Get());
  EXPECT_FALSE(Vireo::NoLiveServices());
  Vireo::ReleaseServices();
  EXPECT_FALSE(Vireo::CServiceT<Vireo::CReporter>::Exists());
  EXPECT_TRUE(Vireo::NoLiveServices());
  Vireo::CServiceT<Vireo::CReporter>::Get();
  EXPECT_TRUE(Vireo::CServiceT<Vireo::CReporter>::Exists());
  Vireo::ReleaseServices();
}

TEST(ServiceTest, ServicesCreatedWhileReleasingAreReleasedInTheSamePass) {
  Vireo::CServiceT<Chained>::Get();
  Vireo::ReleaseServices();
  EXPECT_EQ(Chained::destroyed, 1);
  EXPECT_EQ(Dependent::destroyed, 1);
  EXPECT_FALSE(Vireo::CServiceT<Dependent>::Exists());
  EXPECT_TRUE(Vireo::NoLiveServices());
}

}  // namespace
