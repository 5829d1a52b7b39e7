// Writing a picture into the output folder in a chosen file format.
#pragma once

#include <string>

#include <vips/vips8>

#include "output_dir.h"

namespace Fringe {

// The file formats fringe writes, by their usual file extension.
bool IsWritableFormat(const std::string& ext);  // png, jpg, tif, webp

// The extension of a written photo: the input's own format where fringe can
// write it, PNG otherwise.
std::string PhotoExtensionFor(const std::string& loaderFamily);

// Encodes image as ext (JPEG flattens alpha onto white) and writes it to
// relPath below dir. Returns the path written; throws PageError(Output).
std::string SaveImage(OutputDir& dir, const std::string& relPath, vips::VImage image,
                      const std::string& ext, int quality);

}  // namespace Fringe
