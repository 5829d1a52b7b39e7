// The typical profile across a side after lining the profiles up with the
// side's structures (whose direction may differ slightly from the module's
// side), and how rough the page is along the side at each offset.
#pragma once

#include <vector>

#include "refine/profile_strip.h"

namespace Refine {

struct AlignedProfile {
  double slope = 0.0;    // structures run along s = s0 + slope * (t - tCentre)
  double tCentre = 0.0;  // middle of the sampled stretch of the side
  double sFrom = 0.0;
  double sStep = 1.0;
  std::vector<double> mean;  // median over the lines; NaN where too few reach
  std::vector<double>
      roughness;          // median |difference| between neighbouring lines, as a noise sigma
  double noise = 0.0;     // calmest roughness: the noise of one value, gray levels
  bool areaEnds = false;  // some lines ran out of the sampled area (the page's edge)
  int lines = 0;

  int Size() const { return static_cast<int>(mean.size()); }
  double OffsetOf(double k) const { return sFrom + sStep * k; }
  double IndexOf(double s) const { return (s - sFrom) / sStep; }
};

// Tries slopes within +-maxSlope and keeps the one that makes the mean
// profile's steps sharpest.
AlignedProfile AlignProfiles(const ProfileStrip& strip, double maxSlope);

// Linear interpolation of a NaN-marked series; NaN outside or next to a gap.
double Interpolate(const std::vector<double>& values, double index);

}  // namespace Refine
