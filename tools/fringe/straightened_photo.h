// The photo cut out of the page and turned upright.
#pragma once

#include <vips/vips8>

#include "page_loader.h"
#include "photo_geometry.h"

namespace Fringe {

// The frame's area of the page, turned upright with bicubic interpolation;
// what falls outside the page is white (and transparent when the page has
// alpha). Computed as it is written.
vips::VImage StraightenedPhoto(const DecodedPage& page, const PhotoFrame& frame);

}  // namespace Fringe
