// The page with the detected outline and corner marks drawn on it.
#pragma once

#include <vips/vips8>

#include "page_loader.h"
#include "page_result.h"

namespace Fringe {

// An sRGB picture of the page (alpha flattened onto white) with the outline
// in red and a mark on every corner, the top-left one green so that the
// photo's orientation shows. Only a one-byte mask is held in memory; the
// picture itself is computed as it is written.
vips::VImage OutlinePicture(const DecodedPage& page, const PhotoOutline& outline);

}  // namespace Fringe
