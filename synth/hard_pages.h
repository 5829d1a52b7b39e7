// Hard synthetic scans: the page effects that make photo detection fail on
// real flatbed scans (white-bordered prints, the lid's shadow band and ramp,
// prints that are not quite rectangular, a dark strip of the scanner bed,
// grey and uneven lids, faded, snowy and dark photos, heavy noise, dust,
// photos partly off the page, blank pages), each with its true outline.
//
// Coordinates follow the page generator: pixel (x, y) covers [x, x + 1) x
// [y, y + 1). Built on the generator's random sources, so a recipe always gives
// the same bytes.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "synth/page_generator.h"

namespace Synth {

enum class HardKind : int {
  kPlain = 0,    // a clean print on a white lid
  kWhiteBorder,  // a print with a white paper margin round the picture
  kShadowBand,   // a dark band just outside one or two sides
  kShadowRamp,   // a soft shadow ramp outside a side
  kSheared,      // left and right sides turned 0.1 to 0.2 degrees further
  kBedStrip,     // a dark strip of the scanner bed along a page edge
  kGreyLid,      // a grey lid, darker than the paper
  kUnevenLid,    // a lid whose brightness drifts across the page
  kLowContrast,  // a faded or snowy photo, edges close to the lid
  kDarkPhoto,    // a dark photo
  kHeavyNoise,   // strong sensor noise
  kJpeg,         // to be stored as a low-quality JPEG by whoever writes it
  kOffPage,      // the photo runs over one page edge
  kDust,         // a line of dust specks near one side
  kBlank,        // no photo at all
  kCount
};

std::string_view HardKindName(HardKind kind);
std::optional<HardKind> HardKindFromName(std::string_view name);

// How a picture's tones are laid out.
enum class PictureTone : int { kNormal = 0, kFaded, kSnowy, kDark };

// Shadow cast by the lid just outside one side of the print.
struct SideShadow {
  double bandWidth = 0.0;   // px; 0 for none
  double bandDepth = 0.0;   // fraction of the lid's brightness taken away in the band
  double rampLength = 0.0;  // px, decay length of a soft ramp; 0 for none
  double rampDepth = 0.0;   // fraction taken away right at the paper's edge
};

struct HardPageRecipe {
  HardKind kind = HardKind::kPlain;
  int width = 2000;
  int height = 1500;
  bool color = true;
  uint32_t seed = 1;

  bool hasPhoto = true;
  // The paper: a rectangle of this size about this centre, turned like the
  // generator's photos (positive: counter-clockwise on screen).
  double centerX = 1000.0;
  double centerY = 750.0;
  double paperWidth = 900.0;
  double paperHeight = 600.0;
  double angleDegrees = 0.0;
  double shearDegrees = 0.0;  // left and right sides turned this much further
  double border = 0.0;        // white margin between paper edge and picture, px
  double paperWhite = 248.0;  // brightness of the paper margin
  PictureTone tone = PictureTone::kNormal;
  bool innerLine = false;     // a straight dark line in the picture parallel to a side
  double edgeSoftness = 1.0;  // width of the antialiased transitions, px

  double lidLevel = 242.0;
  double lidUnevenness = 0.0;           // fraction of brightness lost at the darkest spot
  double hingeShadow = 0.0;             // depth of a soft shade along the top edge
  std::array<SideShadow, 4> shadows{};  // top, right, bottom, left side of the paper

  int bedStripSide = -1;  // page edge 0 top, 1 right, 2 bottom, 3 left; -1 none
  double bedStripWidth = 0.0;
  double bedStripLevel = 35.0;

  int dustSide = -1;  // paper side the dust lies along; -1 none
  int dustCount = 0;
  double dustDistance = 0.0;  // px outside the paper

  double noise = 2.0;
  int jpegQuality = 0;  // > 0: store the page as a JPEG of this quality
};

struct HardPage {
  HardPageRecipe recipe;
  Page page;  // corners: the visible paper outline, as the truth files give it
  bool hasPhoto = false;
  // The paper's outline and the picture inside a white margin (equal without
  // one), clipped to the page when the photo runs over its edge.
  std::array<std::array<double, 2>, 4> paper{};
  std::array<std::array<double, 2>, 4> picture{};
};

// A page of the given kind with its parameters drawn from the seed.
HardPageRecipe MakeHardPageRecipe(HardKind kind, uint32_t seed, int width = 2000,
                                  int height = 1500);

// Draws the page. Throws std::invalid_argument for a recipe it cannot draw.
HardPage GenerateHardPage(const HardPageRecipe& recipe);

// count recipes that cycle through every kind, sizes and colour modes varying.
std::vector<HardPageRecipe> HardPageSet(int count, uint32_t seed);

}  // namespace Synth
