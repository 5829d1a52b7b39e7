// Corner errors, detection rule, percentiles.
#include "accuracy/evaluation.h"

#include <algorithm>
#include <cmath>

namespace Accuracy {
namespace {

double Percentile(std::vector<double> values, double p) {
  if (values.empty()) return 0.0;
  std::sort(values.begin(), values.end());
  // Nearest rank: the smallest value with at least p of the values at or below it.
  const auto rank = static_cast<size_t>(std::ceil(p * static_cast<double>(values.size())));
  return values[std::clamp<size_t>(rank, 1, values.size()) - 1];
}

double Mean(const std::vector<double>& values) {
  if (values.empty()) return 0.0;
  double sum = 0.0;
  for (double v : values) sum += v;
  return sum / static_cast<double>(values.size());
}

}  // namespace

double TruthAngle(const Truth& truth) {
  return truth.angle ? *truth.angle : Refine::OutlineAngleDegrees(truth.corners);
}

Score ScoreAnswer(const Truth& truth, const Answer& answer) {
  Score score;
  score.photoPage = truth.photo;
  score.reported = answer.photo;
  if (!truth.photo) {
    score.falseAlarm = answer.photo;
    return score;
  }
  if (!answer.photo) return score;
  for (size_t k = 0; k < 4; ++k) {
    score.cornerError[k] = Refine::Distance(truth.corners[k], answer.corners[k]);
    score.maxCornerError = std::max(score.maxCornerError, score.cornerError[k]);
  }
  score.found = score.maxCornerError <= kFoundLimit;
  double d = answer.angle - TruthAngle(truth);
  while (d > 45.0) d -= 90.0;
  while (d < -45.0) d += 90.0;
  score.angleError = std::abs(d);
  return score;
}

Summary Summarise(const std::vector<Score>& scores) {
  Summary s;
  std::vector<double> corners, angles;
  for (const Score& score : scores) {
    if (!score.photoPage) {
      ++s.blankPages;
      if (!score.falseAlarm) ++s.blankQuiet;
      continue;
    }
    ++s.photoPages;
    if (score.found) ++s.found;
    if (!score.reported) continue;
    corners.insert(corners.end(), score.cornerError.begin(), score.cornerError.end());
    angles.push_back(score.angleError);
  }
  s.cornersMeasured = static_cast<int>(corners.size());
  s.meanError = Mean(corners);
  s.medianError = Percentile(corners, 0.5);
  s.p95Error = Percentile(corners, 0.95);
  s.maxError = corners.empty() ? 0.0 : *std::max_element(corners.begin(), corners.end());
  s.meanAngleError = Mean(angles);
  s.medianAngleError = Percentile(angles, 0.5);
  s.maxAngleError = angles.empty() ? 0.0 : *std::max_element(angles.begin(), angles.end());
  return s;
}

}  // namespace Accuracy
