// Turning libvips' multi-line error buffer into one readable reason.
#pragma once

#include <string>

#include <vips/vips8>

namespace Fringe {

std::string VipsReason(const vips::VError& error);

}  // namespace Fringe
