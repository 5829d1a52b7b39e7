// Position classification: where the dark region of the page lies, graded
// from the darkness profiles.
#pragma once

#include <cstdint>

#include "filter/analysis/double_list.h"

namespace Project {

enum PositionClass : int32_t {
  kUndecided = 0,  // the extents contradict the borders
  kFull = 1,       // the dark run reaches all four borders
  kFlat = 2,       // nothing stands out from the page
  kTouching = 3,   // the dark run reaches one, two or three borders
  kInside = 4,     // the dark run lies clear of all four borders
};

// Start and end index of the above-mean run within entries 9 ... n - 10.
// Leaves both outputs alone for fewer than 3 entries; 0.0 and 0.0 for up to
// 27 entries or fewer than two entries above the mean.
void ProfileExtent(const DoubleList& profile, double& start, double& end);

// Population standard deviation of all entries; 0.0 for two entries or fewer.
double ProfileSpread(const DoubleList& profile);

PositionClass ClassifyPosition(const DoubleList& columns, const DoubleList& rows,
                               double flatnessThreshold);

}  // namespace Project
