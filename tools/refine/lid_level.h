// The lid's brightness across the page: its level, how far it drifts, the
// page's noise, and levelling of a grey or uneven lid to an even white.
#pragma once

#include <array>
#include <cstdint>
#include <vector>

#include "refine/page_image.h"

namespace Refine {

struct LidEstimate {
  double level = 0.0;     // typical gray of the bare lid
  double spread = 0.0;    // brightest minus darkest part of the lid's fitted surface
  double noise = 0.0;     // sensor noise of one gray value
  double residual = 0.0;  // typical distance of calm lid blocks from the surface
  // Lid brightness as a surface over the page: c0 + c1 u + c2 v + c3 u^2 + c4 u v + c5 v^2,
  // with u = x / width and v = y / height.
  std::array<double, 6> surface{};
};

// From calm blocks spread over the page; blocks inside a photo are rejected
// by a robust fit of the surface.
LidEstimate EstimateLid(const PageImage& page);

// The lid's fitted brightness at (u, v), fractions of the page's width and height.
double LidAt(const LidEstimate& lid, double u, double v);

// A lid dark or uneven enough to hurt the module's darkness profiles.
bool NeedsLevelling(double level, double spread);

// Divides a tight interleaved copy by the lid's surface so that the lid
// becomes an even 245.
void LevelLid(std::vector<uint8_t>& pixels, int width, int height, int channels);

}  // namespace Refine
