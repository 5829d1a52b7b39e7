// Scoring one page.
#include "accuracy/run.h"

namespace Accuracy {

Answer RawAnswerOf(const Refine::ModuleAnswer& answer) {
  Answer a;
  a.photo = answer.FoundPhoto();
  for (size_t k = 0; k < 4; ++k)
    a.corners[k] = {answer.corners[k].x + 0.5, answer.corners[k].y + 0.5};
  a.angle = answer.angle;
  return a;
}

Answer RefinedAnswerOf(const Refine::Refinement& refined) {
  Answer a;
  a.photo = refined.status != Refine::RefineStatus::kNoPhoto;
  for (size_t k = 0; k < 4; ++k)
    a.corners[k] = {refined.outline[k].x + 0.5, refined.outline[k].y + 0.5};
  a.angle = refined.angle;
  return a;
}

PageOutcome RunCase(Refine::Detector& detector, const PageCase& c,
                    const Refine::PipelineOptions& options) {
  const Refine::PipelineResult result = Refine::DetectAndRefine(detector, c.page.View(), options);
  PageOutcome o;
  o.name = c.name;
  o.kind = c.truth.kind;
  o.rawAnswer = RawAnswerOf(result.raw);
  o.refinedAnswer = RefinedAnswerOf(result.refined);
  o.raw = ScoreAnswer(c.truth, o.rawAnswer);
  o.refined = ScoreAnswer(c.truth, o.refinedAnswer);
  o.status = std::string(Refine::StatusName(result.refined.status));
  for (size_t k = 0; k < 4; ++k) {
    const Refine::SideResult& side = result.refined.sides[k];
    o.sides[k] = std::string(Refine::StatusName(side.status)) + ": " + side.note;
  }
  for (const auto& p : result.preparations) o.preparations.push_back(p.kind);
  o.detectMs = result.detectSeconds * 1e3;
  o.prepareMs = result.prepareSeconds * 1e3;
  o.refineMs = result.refineSeconds * 1e3;
  return o;
}

}  // namespace Accuracy
