// The module's box around only part of a faint photo: refinement starts again
// from the photo's whole extent on the lid and finds the paper's outline.
#include <gtest/gtest.h>

#include "accuracy/page_cases.h"
#include "accuracy/run.h"
#include "refine/pipeline.h"

namespace Accuracy {
namespace {

// Answers with a fixed outline, as a module whose box took an inner edge would.
class FixedDetector : public Refine::Detector {
 public:
  explicit FixedDetector(Refine::ModuleAnswer answer) : answer_(answer) {}
  Refine::ModuleAnswer Detect(const Refine::PageImage&,
                              const std::optional<Refine::FilterRect>&) override {
    return answer_;
  }

 private:
  Refine::ModuleAnswer answer_;
};

// The part of the truth's outline from `from` to 1 along its top and bottom.
Refine::ModuleAnswer PartOf(const Truth& truth, double from) {
  const Refine::Quad& q = truth.corners;
  Refine::ModuleAnswer a;
  a.corners = {q[0] + (q[1] - q[0]) * from, q[1], q[2], q[3] + (q[2] - q[3]) * from};
  for (auto& p : a.corners) p = {std::round(p.x), std::round(p.y)};
  a.angle = Refine::OutlineAngleDegrees(a.corners);
  a.confidence = 255;
  return a;
}

TEST(PartialModuleBox, GrowsToTheWholeFaintPhoto) {
  for (uint32_t seed = 1; seed <= 3; ++seed) {
    const PageCase c =
        GeneratedCase(Synth::MakeHardPageRecipe(Synth::HardKind::kLowContrast, seed, 1200, 900));
    ASSERT_TRUE(c.truth.photo);
    FixedDetector detector(PartOf(c.truth, 0.7));
    const Refine::PipelineResult r = Refine::DetectAndRefine(detector, c.page.View());
    const Score raw = ScoreAnswer(c.truth, RawAnswerOf(r.raw));
    const Score refined = ScoreAnswer(c.truth, RefinedAnswerOf(r.refined));
    ASSERT_FALSE(raw.found) << c.name;
    EXPECT_EQ(r.refined.status, Refine::RefineStatus::kRefined)
        << c.name << ": " << r.refined.reason;
    EXPECT_TRUE(refined.found) << c.name;
    EXPECT_LE(refined.maxCornerError, 2.0) << c.name;
    // The module's own answer is passed on untouched.
    EXPECT_EQ(r.raw.corners, detector.Detect(c.page.View(), std::nullopt).corners);
  }
}

TEST(PartialModuleBox, ABlankPageStaysBlankWhateverTheModuleClaims) {
  const PageCase c =
      GeneratedCase(Synth::MakeHardPageRecipe(Synth::HardKind::kBlank, 5, 1200, 900));
  ASSERT_FALSE(c.truth.photo);
  Refine::ModuleAnswer claim;
  claim.corners = {Refine::Vec2{300, 200}, Refine::Vec2{800, 220}, Refine::Vec2{790, 600},
                   Refine::Vec2{290, 580}};
  claim.angle = -2.0;
  claim.confidence = 255;
  FixedDetector detector(claim);
  const Refine::PipelineResult r = Refine::DetectAndRefine(detector, c.page.View());
  EXPECT_FALSE(ScoreAnswer(c.truth, RefinedAnswerOf(r.refined)).reported) << r.refined.reason;
}

}  // namespace
}  // namespace Accuracy
