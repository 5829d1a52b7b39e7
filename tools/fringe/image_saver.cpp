// Encoding with libvips straight into a file descriptor of the output folder.
#include "image_saver.h"

#include "page_error.h"
#include "vips_text.h"

namespace Fringe {

bool IsWritableFormat(const std::string& ext) {
  return ext == "png" || ext == "jpg" || ext == "tif" || ext == "webp";
}

std::string PhotoExtensionFor(const std::string& family) {
  if (family == "jpeg") return "jpg";
  if (family == "tiff") return "tif";
  if (family == "png" || family == "webp") return family;
  return "png";
}

std::string SaveImage(OutputDir& dir, const std::string& relPath, vips::VImage image,
                      const std::string& ext, int quality) {
  if (ext == "jpg" && image.has_alpha()) {
    image = image.flatten(vips::VImage::option()->set("background", std::vector<double>{255.0}))
                .cast(VIPS_FORMAT_UCHAR);
  }
  const std::string suffix = "." + ext;
  return dir.Write(relPath, [&](int fd) {
    try {
      // The option set is handed over to (and freed by) the call below.
      vips::VOption* options = vips::VImage::option();
      if (ext == "jpg" || ext == "webp") options->set("Q", quality);
      if (ext == "tif") options->set("compression", VIPS_FOREIGN_TIFF_COMPRESSION_DEFLATE);
      vips::VTarget target = vips::VTarget::new_to_descriptor(fd);
      image.write_to_target(suffix.c_str(), target, options);
    } catch (const vips::VError& e) {
      throw PageError(ErrorKind::Output,
                      "cannot write " + (dir.Path() + "/" + relPath) + ": " + VipsReason(e));
    }
  });
}

}  // namespace Fringe
