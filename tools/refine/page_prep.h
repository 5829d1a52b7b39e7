// Preparing a page for the module where the page itself is what makes the
// module fail: a dark strip of the scanner bed along an edge is left out of
// the filter rectangle, heavy sensor noise is smoothed, a grey or uneven lid
// is levelled to an even white. The page itself is never changed; a prepared
// copy is made only when a step needs one.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "refine/detector.h"
#include "refine/lid_level.h"
#include "refine/page_image.h"

namespace Refine {

struct Preparation {
  std::string kind;    // "bed-strip", "smooth-noise", "level-lid"
  std::string detail;  // what was found and done, in words
};

struct PrepareOptions {
  bool bedStrips = true;
  bool smoothNoise = true;
  bool levelLid = true;
};

struct PageSurvey {
  std::array<int, 4> bedStrip{};  // px to leave out at the top, right, bottom and left edge
  double lidLevel = 0.0;          // typical gray of the bare lid
  double lidSpread = 0.0;         // how far the lid's brightness drifts across the page
  double noise = 0.0;             // sensor noise of one gray value
  LidEstimate lid;                // the lid across the page
};

// Looks at the page's edges, lid and noise without changing anything.
PageSurvey SurveyPage(const PageImage& page);

struct PreparedPage {
  std::vector<Preparation> steps;  // empty: the module sees the page as it is
  std::optional<FilterRect> filterRect;
  std::vector<uint8_t> pixels;  // the prepared copy, when one was needed
  PageImage view;               // what the module should see: the page or the copy
  PageSurvey survey;
};

PreparedPage PreparePage(const PageImage& page, const PrepareOptions& options = {});

}  // namespace Refine
