// Refinement of the module's answer: starting from its corners and angle,
// each side of the photo is found again in the page itself and fitted with a
// line of its own; the corners are where neighbouring lines meet. The module's
// answer is only read, never changed; when refinement cannot do better it
// keeps that answer and says so.
//
// Coordinates: x to the right, y downward, pixel centres at integers, so a
// pixel covers [x - 0.5, x + 0.5]. The module's corners (v, h) are pixel
// indices in the same frame.
#pragma once

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "refine/geometry.h"
#include "refine/lid_level.h"
#include "refine/page_image.h"
#include "refine/side_frame.h"

namespace Refine {

// The module's answer as it published it.
struct ModuleAnswer {
  Quad corners{};  // pt1 ... pt4 as (h, v)
  double angle = 0.0;
  int confidence = 0;

  // From the descriptor's values pt1v, pt1h, ..., pt4v, pt4h.
  static ModuleAnswer FromPoints(const std::array<int32_t, 8>& points, double angle,
                                 int confidence);
  bool FoundPhoto() const { return confidence == 255; }
};

enum class SideStatus {
  kRefined,   // fitted to edge positions found along the side
  kCoarse,    // placed from the side's mean profile (too few single positions)
  kPageEdge,  // the paper runs off the page: the page's edge
  kInferred,  // an invisible white margin, placed from the other sides' width
  kKept,      // the module's side
};

enum class RefineStatus {
  kRefined,  // every side found again
  kPartial,  // some sides kept from the module's answer
  kKept,     // the module's answer kept whole
  kNoPhoto,  // the module found no photo, or nothing on the page supports its outline
};

std::string_view StatusName(RefineStatus status);
std::string_view StatusName(SideStatus status);

struct SideResult {
  SideStatus status = SideStatus::kKept;
  Line line{};
  double rms = 0.0;       // spread of the edge positions about the line, px
  double support = 0.0;   // share of the positions along the side that agree with it
  double contrast = 0.0;  // step across the edge, gray levels
  double shift = 0.0;     // how far the side moved outward from the module's, px (mid-side)
  bool band = false;      // a lid shadow band lies outside it
  bool margin = false;    // a white margin lies inside it
  std::string note;
};

struct Refinement {
  RefineStatus status = RefineStatus::kKept;
  std::string reason;
  Quad outline{};                     // the paper's outer edge
  double angle = 0.0;                 // degrees, the module's sign convention
  std::array<SideResult, 4> sides{};  // top, right, bottom, left
  bool margin = false;                // a white paper margin was found
  Quad picture{};                     // the picture inside the margin (the outline without one)
};

struct RefineOptions {
  // Pixels outside this area are never read (a bed strip left out, say);
  // unset: the whole page.
  std::optional<SampleArea> area;
  bool findMargin = true;  // look for a white paper margin
  // The lid across the page; unset: estimated from the page.
  std::optional<LidEstimate> lid;
  // Called with each side's mean profile and its reading, for diagnostics.
  std::function<void(int side, const struct AlignedProfile&, const struct SideReading&)> inspect;
};

Refinement RefineOutline(const PageImage& page, const ModuleAnswer& answer,
                         const RefineOptions& options = {});

// The part of the page refinement reads: the options' area, else the whole page.
SampleArea AreaToRead(const PageImage& page, const RefineOptions& options);

// The module's answer passed on as it is (kKept, or kNoPhoto when it found none).
Refinement Unrefined(const ModuleAnswer& answer, std::string reason);

}  // namespace Refine
