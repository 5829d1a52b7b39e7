// Reading one side's aligned profile: which step across the side is the
// paper's edge (not the outer side of the lid's shadow band, not dust on the
// lid), whether a white paper margin lies inside it and where the picture
// begins, or whether the paper runs on past the page.
#pragma once

#include <string>

#include "refine/aligned_profile.h"

namespace Refine {

struct SideReading {
  bool found = false;
  double offset = 0.0;  // the paper's edge at s = offset + slope * (t - tCentre)
  double slope = 0.0;
  double tCentre = 0.0;
  int polarity = 0;       // +1 when the page is brighter outside the edge, -1 darker
  double contrast = 0.0;  // step across the edge, gray levels
  double gradient = 0.0;  // steepest slope of the step, gray levels per px
  bool pageEdge = false;  // the paper runs on past the sampled area
  bool band = false;      // a shadow band lies just outside
  double bandWidth = 0.0;
  bool paleInside = false;  // calm and bright just inside the edge, as a margin is
  bool margin = false;      // a white paper margin lies inside the edge
  double innerOffset = 0.0;
  int innerPolarity = 0;
  double lid = 0.0;          // lid level outside the edge
  double expectedLid = 0.0;  // the lid's level expected there from the whole page
  double noise = 0.0;        // noise of one profile value
  std::string note;          // what decided the reading
};

struct ReadOptions {
  double maxBandWidth = 12.0;   // widest shadow band, px
  double maxMarginWidth = 0.0;  // widest white margin looked for, px (0: none)
  double pageNoise = 0.0;       // the page's noise (one value); 0: the profile's own
  double expectedLid = 0.0;     // the lid's level beyond this side; 0: unknown
  double lidTolerance = 15.0;   // how far the lid may differ from that, gray levels
};

SideReading ReadSide(const AlignedProfile& profile, const ReadOptions& options);

}  // namespace Refine
