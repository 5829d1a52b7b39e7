// Decoding with libvips: header checks first, then one decode into memory.
#include "page_loader.h"

#include <sys/stat.h>

#include <cerrno>
#include <cstring>

#include "page_error.h"
#include "vips_text.h"

namespace Fringe {

namespace {

[[noreturn]] void Refuse(const std::string& why) {
  throw PageError(ErrorKind::BadInput, why);
}

void CheckFile(const std::string& path) {
  struct stat st {};
  if (::stat(path.c_str(), &st) != 0) Refuse(std::strerror(errno));
  if (S_ISDIR(st.st_mode)) Refuse("is a directory");
  if (!S_ISREG(st.st_mode)) Refuse("not a regular file");
  if (st.st_size == 0) Refuse("empty file");
  if (::access(path.c_str(), R_OK) != 0) Refuse(std::strerror(errno));
}

// "jpegload" -> "jpeg", "VipsForeignLoadPngFile" -> "png".
std::string LoaderFamily(const char* loader) {
  std::string name = loader;
  const std::string prefix = "VipsForeignLoad";
  if (name.rfind(prefix, 0) == 0) {
    name = name.substr(prefix.size());
    for (const char* tail : {"File", "Source", "Buffer"}) {
      const std::string t = tail;
      if (name.size() > t.size() && name.compare(name.size() - t.size(), t.size(), t) == 0) {
        name.resize(name.size() - t.size());
      }
    }
    for (char& c : name) c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
  } else if (name.size() > 4 && name.compare(name.size() - 4, 4, "load") == 0) {
    name.resize(name.size() - 4);
  }
  if (name == "nsgif") name = "gif";
  return name;
}

// Among the loaders libvips trusts, the first (in libvips' own order of
// preference) that claims the file, by its leading bytes or, for loaders that
// cannot sniff, by its name; null when none does. Loaders that libvips marks
// untrusted are not even asked: some read the whole file, decompressing it
// into memory, just to answer, and a file only they would claim is, for
// fringe, not an image (often a damaged one).
const char* FindTrustedLoader(const std::string& path) {
  const VipsSListMap2Fn claims = [](void* item, void* file, void*) -> void* {
    auto* load = static_cast<VipsForeignLoadClass*>(item);
    const VipsForeignClass& foreign = load->parent_class;
    const VipsOperationClass& operation = foreign.parent_class;
    const VipsObjectClass& object = operation.parent_class;
    const auto* name = static_cast<const char*>(file);
    // Memory and stream loaders are the same formats again.
    if (vips_ispostfix(object.nickname, "_buffer") || vips_ispostfix(object.nickname, "_source")) {
      return nullptr;
    }
    if ((operation.flags & (VIPS_OPERATION_UNTRUSTED | VIPS_OPERATION_BLOCKED)) != 0)
      return nullptr;
    if (load->is_a != nullptr) return load->is_a(name) ? item : nullptr;
    if (foreign.suffs != nullptr && vips_filename_suffix_match(name, foreign.suffs)) return item;
    return nullptr;
  };
  void* found =
      vips_foreign_map("VipsForeignLoad", claims, const_cast<char*>(path.c_str()), nullptr);
  return found != nullptr ? G_OBJECT_CLASS_NAME(found) : nullptr;
}

bool NeedsColourConversion(VipsInterpretation i) {
  switch (i) {
    case VIPS_INTERPRETATION_CMYK:
    case VIPS_INTERPRETATION_LAB:
    case VIPS_INTERPRETATION_LABQ:
    case VIPS_INTERPRETATION_LABS:
    case VIPS_INTERPRETATION_LCH:
    case VIPS_INTERPRETATION_CMC:
    case VIPS_INTERPRETATION_XYZ:
    case VIPS_INTERPRETATION_YXY:
    case VIPS_INTERPRETATION_HSV:
    case VIPS_INTERPRETATION_scRGB:
      return true;
    default:
      return false;
  }
}

// Brings any decoded image to 8-bit gray or sRGB with an optional alpha band.
vips::VImage ToDetectable(vips::VImage image, bool& alpha, bool& converted) {
  alpha = image.has_alpha();
  converted = false;
  if (NeedsColourConversion(image.interpretation())) {
    image = image.colourspace(VIPS_INTERPRETATION_sRGB);
    converted = true;
    alpha = image.has_alpha();
  }
  if (image.format() != VIPS_FORMAT_UCHAR) {
    // 16-bit samples keep their top byte; floats are clipped into 0..255.
    const bool integer = vips_band_format_isint(image.format());
    image = image.cast(VIPS_FORMAT_UCHAR, vips::VImage::option()->set("shift", integer));
  }
  const int colourBands = image.bands() - (alpha ? 1 : 0);
  if (colourBands < 1) Refuse("image has no colour bands");
  const int channels = colourBands >= 3 ? 3 : 1;
  if (colourBands != channels || alpha) {
    vips::VImage colour = image.extract_band(0, vips::VImage::option()->set("n", channels));
    image = alpha ? colour.bandjoin(image[image.bands() - 1]) : colour;
  }
  return image.copy(vips::VImage::option()->set(
      "interpretation", channels == 1 ? VIPS_INTERPRETATION_B_W : VIPS_INTERPRETATION_sRGB));
}

}  // namespace

const uint8_t* DecodedPage::Pixels() const {
  return static_cast<const uint8_t*>(image.data());
}

std::ptrdiff_t DecodedPage::RowBytes() const {
  return static_cast<std::ptrdiff_t>(VIPS_IMAGE_SIZEOF_LINE(image.get_image()));
}

DecodedPage LoadPage(const std::string& path, const LoadLimits& limits) {
  CheckFile(path);
  const char* loader = FindTrustedLoader(path);
  if (loader == nullptr) {
    vips_error_clear();
    Refuse("not an image format that libvips can read, or damaged beyond recognition");
  }
  DecodedPage page;
  page.format = LoaderFamily(loader);

  vips::VImage header;
  try {
    // Opening reads only the header; no pixels are decoded yet.
    header = vips::VImage::new_from_file(path.c_str(), vips::VImage::option()
                                                           ->set("access", VIPS_ACCESS_SEQUENTIAL)
                                                           ->set("fail_on", VIPS_FAIL_ON_ERROR));
  } catch (const vips::VError& e) {
    Refuse("cannot read " + page.format + " header: " + VipsReason(e));
  }
  const int64_t w = header.width(), h = header.height();
  if (w < 1 || h < 1) Refuse("image has no pixels");
  const uint64_t pixels = static_cast<uint64_t>(w) * static_cast<uint64_t>(h);
  if (pixels > limits.maxPixels) {
    Refuse("image is " + std::to_string(w) + " x " + std::to_string(h) + " = " +
           std::to_string(pixels) + " pixels, above the limit of " +
           std::to_string(limits.maxPixels) + " (--max-pixels)");
  }
  if ((w > kModuleMaxSide || h > kModuleMaxSide) && limits.maxSide == 0) {
    Refuse("image is " + std::to_string(w) + " x " + std::to_string(h) + ", wider or taller than " +
           std::to_string(kModuleMaxSide) +
           " pixels; use --max-side N to detect on a downscaled copy");
  }

  try {
    bool alpha = false, converted = false;
    page.image = ToDetectable(header, alpha, converted).copy_memory();
    page.alpha = alpha;
    page.colourConverted = converted;
  } catch (const vips::VError& e) {
    Refuse("cannot decode " + page.format + " data: " + VipsReason(e));
  }
  page.width = page.image.width();
  page.height = page.image.height();
  page.channels = page.image.bands() - (page.alpha ? 1 : 0);
  return page;
}

vips::VImage DownscaledCopy(const DecodedPage& page, int32_t maxSide) {
  const double longer = std::max(page.width, page.height);
  const double scale = maxSide / longer;
  vips::VImage small = page.image;
  if (page.alpha) small = small.premultiply();
  small = small.resize(scale, vips::VImage::option()->set("kernel", VIPS_KERNEL_LANCZOS3));
  if (page.alpha) small = small.unpremultiply().cast(VIPS_FORMAT_UCHAR);
  // Rounding in resize may leave one pixel too many.
  const int w = std::min(small.width(), maxSide), h = std::min(small.height(), maxSide);
  if (w != small.width() || h != small.height()) small = small.crop(0, 0, w, h);
  return small.copy_memory();
}

}  // namespace Fringe
