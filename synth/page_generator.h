// Deterministic synthetic scanned pages: a light paper page with texture,
// noise and an optional lid shadow, and a textured photo lying on it at a
// known centre, size and angle. The same recipe always gives the same bytes.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <vector>

namespace Synth {

// A photo on the page. Coordinates are continuous pixel units: pixel (x, y)
// covers [x, x + 1) x [y, y + 1), so its centre is (x + 0.5, y + 0.5).
// A positive angle turns the photo counter-clockwise as seen on screen
// (y grows downward); the analysis reports the same angle with the same sign.
struct PhotoRecipe {
  double centerX = 0.0;
  double centerY = 0.0;
  double width = 0.0;
  double height = 0.0;
  double angleDegrees = 0.0;
};

struct PageRecipe {
  int width = 2000;
  int height = 1500;
  bool color = true;        // three channels (RGB) or one (grayscale)
  bool alpha = false;       // add a transparency plane behind the colour channels
  uint8_t pageAlpha = 255;  // transparency of the bare page; the photo is opaque
  std::optional<PhotoRecipe> photo;
  bool lidShadow = false;  // a soft shadow along the top edge of the page
  double noise = 2.0;      // standard deviation of the sensor noise, in gray levels
  uint32_t seed = 1;
};

struct Page {
  int width = 0;
  int height = 0;
  int channels = 0;             // includes the transparency plane when present
  std::vector<uint8_t> pixels;  // interleaved, rows tightly packed, top row first
  // The photo's corners (x, y), clockwise from its top-left corner; the page's
  // own corners (0, 0), (W, 0), (W, H), (0, H) when there is no photo.
  std::array<std::array<double, 2>, 4> corners{};
};

// Builds the page. Throws std::invalid_argument for a size below 1 or beyond
// 65535 a side, or a photo of non-positive or non-finite size.
Page GeneratePage(const PageRecipe& recipe);

// The corners that GeneratePage reports for a photo, without drawing it.
std::array<std::array<double, 2>, 4> PhotoCorners(const PhotoRecipe& photo);

}  // namespace Synth
