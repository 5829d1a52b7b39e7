// Scoring answers against a page's true outline: corner errors, the 10 px
// detection rule, angle errors, and the summary figures of a page set.
#pragma once

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "refine/geometry.h"

namespace Accuracy {

// Truth and answers in the generator's continuous coordinates: pixel (x, y)
// covers [x, x + 1) x [y, y + 1).
struct Truth {
  bool photo = false;
  Refine::Quad corners{};       // the paper's outline
  std::optional<double> angle;  // degrees, the module's sign; from the corners when unset
  std::string kind;             // what makes the page hard
};

struct Answer {
  bool photo = false;
  Refine::Quad corners{};
  double angle = 0.0;
};

struct Score {
  bool photoPage = false;
  bool reported = false;    // the answer reports a photo
  bool found = false;       // photo page, reported, all corners within the limit
  bool falseAlarm = false;  // blank page, photo reported
  std::array<double, 4> cornerError{};
  double maxCornerError = 0.0;
  double angleError = 0.0;
};

inline constexpr double kFoundLimit = 10.0;

Score ScoreAnswer(const Truth& truth, const Answer& answer);

struct Summary {
  int photoPages = 0;
  int found = 0;
  int blankPages = 0;
  int blankQuiet = 0;  // blank pages with no photo reported
  int cornersMeasured = 0;
  double meanError = 0.0, medianError = 0.0, p95Error = 0.0, maxError = 0.0;
  double meanAngleError = 0.0, medianAngleError = 0.0, maxAngleError = 0.0;
};

// Corner and angle figures come from every photo page where a photo was reported.
Summary Summarise(const std::vector<Score>& scores);

// The true angle: the one given, or the mean turn of the outline's sides.
double TruthAngle(const Truth& truth);

}  // namespace Accuracy
