// Angle estimation: a vote of local outline directions into half-degree bins.
#pragma once

#include <cstdint>

#include "filter/analysis/double_list.h"

namespace Project {

// Direction in degrees of the least-squares line (y on x) through the w
// points around entry i; the list is a ring, so a window at one end takes
// points from the other.
double LocalDirection(const DoubleList& xs, const DoubleList& ys, int32_t i, uint32_t w);

// Folds a direction in degrees into one quarter turn: first into -90 ... 90,
// then into -45 ... 45. Exactly +45 and -45 stay as they are.
double FoldToQuarterTurn(double degrees);

// The histogram bin of a folded direction: floor((a + 45) x bins / 90 + 0.5).
// bins itself (for +45) and anything outside 0 ... bins - 1 casts no vote.
int32_t VoteBin(double folded, int32_t bins);

// Writes the photo's angle in degrees and answers true. Unequal lists or
// fewer than 6 points: writes 0.0 and answers false. Fewer than one bin or no
// memory for the histogram: answers false and leaves the angle alone.
bool EstimateAngle(const DoubleList& xs, const DoubleList& ys, int32_t bins, double& angle);

}  // namespace Project
