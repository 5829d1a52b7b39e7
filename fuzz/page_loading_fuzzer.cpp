// Fuzz target: fringe's page loading on mutated image files of every format
// it reads. A file is either refused with a page error or becomes a page the
// module can take: 1 to 32767 pixels a side, gray or RGB with optional alpha,
// 8-bit samples, every row readable.
#include <unistd.h>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

#include <vips/vips8>

#include "fuzz_check.h"
#include "page_error.h"
#include "page_loader.h"

namespace {

const std::string& ScratchFile() {
  static const std::string path = [] {
    const std::filesystem::path folder = std::filesystem::temp_directory_path() /
                                         ("fringe-fuzz-pages-" + std::to_string(::getpid()));
    std::filesystem::create_directories(folder);
    return (folder / "page").string();
  }();
  return path;
}

void RemoveScratch() {
  std::error_code ignored;
  std::filesystem::remove_all(std::filesystem::path(ScratchFile()).parent_path(), ignored);
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int*, char*** argv) {
  if (VIPS_INIT(argv != nullptr && *argv != nullptr ? (*argv)[0] : "fuzz") != 0) {
    Fuzz::Fail("cannot start libvips");
  }
  // As fringe runs it: untrusted loaders off, no caching between files.
  vips_block_untrusted_set(TRUE);
  vips_cache_set_max(0);
  vips_concurrency_set(1);
  // The path must exist before the exit handler is registered, so that it is
  // destroyed after the handler has used it.
  ScratchFile();
  std::atexit(RemoveScratch);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  {
    std::ofstream out(ScratchFile(), std::ios::binary | std::ios::trunc);
    out.write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
  }
  Fringe::LoadLimits limits;
  limits.maxPixels = uint64_t{1} << 22;  // a mutated header must not ask for gigabytes
  try {
    const Fringe::DecodedPage page = Fringe::LoadPage(ScratchFile(), limits);
    Fuzz::Check(page.width >= 1 && page.width <= Fringe::kModuleMaxSide, "page width out of range");
    Fuzz::Check(page.height >= 1 && page.height <= Fringe::kModuleMaxSide,
                "page height out of range");
    Fuzz::Check(page.channels == 1 || page.channels == 3, "page neither gray nor RGB");
    Fuzz::Check(page.image.format() == VIPS_FORMAT_UCHAR, "page samples not 8-bit");
    Fuzz::Check(page.image.bands() == page.channels + (page.alpha ? 1 : 0), "page bands disagree");
    Fuzz::Check(page.Pixels() != nullptr, "page without pixels in memory");
    const std::ptrdiff_t rowBytes = page.RowBytes();
    Fuzz::Check(rowBytes >= static_cast<std::ptrdiff_t>(page.width) * page.image.bands(),
                "page rows shorter than a row of pixels");
    // Touch every row's first and last byte, so that a short buffer shows.
    unsigned sum = 0;
    for (int32_t y = 0; y < page.height; ++y) {
      const uint8_t* row = page.Pixels() + y * rowBytes;
      sum += row[0] + row[static_cast<size_t>(page.width) * page.image.bands() - 1];
    }
    // An asm barrier keeps the reads without a variable the compiler calls unused.
    asm volatile("" : : "r"(sum) : "memory");
  } catch (const Fringe::PageError& e) {
    Fuzz::Check(e.Kind() == Fringe::ErrorKind::BadInput,
                std::string("a bad file reported as another kind of failure: ") + e.what());
  }
  vips_error_clear();
  return 0;
}
