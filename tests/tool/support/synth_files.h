// Synthetic scanned pages written as image files in every layout fringe
// reads, with the photo's true corners and size.
#pragma once

#include <string>

#include <vips/vips8>

#include "synth/page_generator.h"

namespace FringeTest {

// How the page's samples are stored in the file.
enum class Layout { Rgb, Gray, Palette, Cmyk, Rgb16, Gray16, RgbAlpha, GrayAlpha };

const char* LayoutName(Layout layout);

// A page of the given size with a photo centred near the middle, turned by
// angle degrees, about half the page across; photo = false leaves the page bare.
Synth::PageRecipe PageWithPhoto(int width, int height, double angle, bool photo = true,
                                uint32_t seed = 3);

// The generated pixels as an image (8-bit, interleaved, in memory).
vips::VImage ImageOf(const Synth::Page& page);

// Writes page to path (format from the extension: .png .jpg .tif .webp) in the
// given layout. Lossless formats keep the 8-bit samples exactly, for layouts
// that hold them (16-bit files hold each sample times 257).
void WritePage(const Synth::Page& page, const std::string& path, Layout layout);

// Starts libvips once for the test program.
void EnsureVips();

}  // namespace FringeTest
